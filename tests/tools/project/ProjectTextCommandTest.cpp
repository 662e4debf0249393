#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

class ProjectTextCommand : public ToolTest {
protected:
    void SetUp() override { ASSERT_EQ(tool({"init", "--name", "first"}).exitCode, 0); }
};

TEST_F(ProjectTextCommand, setsTheNameForTheNextProcess) {
    EXPECT_THAT(tool({"name", "second"}), SucceedsSilently());

    EXPECT_THAT(tool({"name"}), Prints("second\n"));
}

TEST_F(ProjectTextCommand, setsTheDescriptionAndLeavesTheNameAlone) {
    EXPECT_THAT(tool({"description", "Pumps water\nand oil"}), SucceedsSilently());

    EXPECT_THAT(tool({"description"}), Prints("Pumps water\nand oil\n"));
    EXPECT_THAT(tool({"name"}), Prints("first\n"));
}

TEST_F(ProjectTextCommand, showsAnEmptyLineForADescriptionThatWasNeverSet) {
    EXPECT_THAT(tool({"description"}), Prints("\n"));
}

TEST_F(ProjectTextCommand, acceptsAnEmptyText) {
    EXPECT_THAT(tool({"name", ""}), SucceedsSilently());

    EXPECT_THAT(tool({"name"}), Prints("\n"));
}

TEST_F(ProjectTextCommand, preservesBytesThatAreNotUtf8) {
    EXPECT_THAT(tool({"name", "caf\xE9 \xD7\xA9\xD7\x9C\xD7\x95\xD7\x9D"}), SucceedsSilently());

    EXPECT_THAT(tool({"name"}), Prints("caf\xE9 \xD7\xA9\xD7\x9C\xD7\x95\xD7\x9D\n"));
}

TEST_F(ProjectTextCommand, doesNotLetATextControlTheTerminal) {
    ASSERT_THAT(tool({"description", "red \x1B[31m\nline"}), SucceedsSilently());
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"description"}).output, "red \\033[31m\r\nline\r\n");
}

TEST_F(ProjectTextCommand, refusesTwoTexts) {
    EXPECT_THAT(tool({"name", "one", "two"}), FailsWith(2, "two"));
}

} // namespace
} // namespace project::test
