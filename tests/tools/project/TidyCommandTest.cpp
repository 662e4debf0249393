#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

class TidyCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.file(u"a");
        folder_.file(u"b");
        ASSERT_THAT(tool({"add", "a", "b"}), SucceedsSilently());
    }
};

TEST_F(TidyCommand, rewritesTheTextInItsCanonicalForm) {
    auto const tidy = readText();
    auto untidy = tidy;
    untidy.replace(untidy.find("\"a\"\n\"b\"\n"), 8, "\"b\"\n\n \"a\"\r\n\"a\"\n");
    writeText(untidy);

    EXPECT_THAT(tool({"tidy"}), SucceedsSilently());

    EXPECT_EQ(readText(), tidy);
}

TEST_F(TidyCommand, doesNotChangeATidyText) {
    auto const before = std::filesystem::last_write_time(text());

    EXPECT_THAT(tool({"tidy"}), SucceedsSilently());

    EXPECT_EQ(std::filesystem::last_write_time(text()), before);
}

TEST_F(TidyCommand, reportsOnATerminal) {
    settings_.onTerminal = true;
    EXPECT_EQ(tool({"tidy"}).output, "The project's text is already tidy.\r\n");

    writeText(readText() + "\"torn");

    EXPECT_EQ(tool({"tidy"}).output, "The project's text was tidied.\r\n");
}

TEST_F(TidyCommand, refusesADamagedText) {
    insertLineBefore("\"b\"", "{\"file\":");

    EXPECT_THAT(tool({"tidy"}), FailsWith(5, text().string() + ":3: "));
}

} // namespace
} // namespace project::test
