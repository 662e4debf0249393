#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

class Language : public ToolTest {
protected:
    void SetUp() override { initProject(); }

    static constexpr auto english = "is not in the project";
    static constexpr auto german = "ist nicht im Projekt";
};

TEST_F(Language, isEnglishByDefault) {
    EXPECT_THAT(tool({"list", "missing"}), FailsWith(1, english));
}

TEST_F(Language, isReadFromTheEnvironment) {
    settings_.environment["LANG"] = "de_DE.UTF-8";

    EXPECT_THAT(tool({"list", "missing"}), FailsWith(1, german));
}

TEST_F(Language, isReadFromTheVariableWithPrecedence) {
    settings_.environment["LANG"] = "en_GB.UTF-8";
    settings_.environment["LC_MESSAGES"] = "de";
    EXPECT_THAT(tool({"list", "missing"}), FailsWith(1, german));

    settings_.environment["LC_ALL"] = "C";
    EXPECT_THAT(tool({"list", "missing"}), FailsWith(1, english));
}

TEST_F(Language, ignoresAnEmptyVariable) {
    settings_.environment["LC_ALL"] = "";
    settings_.environment["LANG"] = "de_AT@euro";

    EXPECT_THAT(tool({"list", "missing"}), FailsWith(1, german));
}

TEST_F(Language, isEnglishWhereThereIsNoTranslation) {
    settings_.environment["LANG"] = "eo.UTF-8";

    EXPECT_THAT(tool({"list", "missing"}), FailsWith(1, english));
}

} // namespace
} // namespace project::test
