#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;

/// On a terminal, with a pager that marks each line.
class Pager : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        folder_.addFile("a.txt");
        ASSERT_EQ(tool({"add", "a.txt"}).exitCode, 0);
        settings_.onTerminal = true;
        settings_.environment["TERM"] = "xterm";
        settings_.environment["PROJECTCTL_PAGER"] = "sed 's/^/paged:/'";
    }
};

TEST_F(Pager, showsTheOutputOfVerbsThatList) {
    EXPECT_THAT(tool({"list"}).output, HasSubstr("paged:a.txt"));
    EXPECT_THAT(tool({"label", "list"}).output, Not(HasSubstr("paged:"))); // nothing to show
    EXPECT_THAT(tool({"status"}).output, HasSubstr("paged:"));
    EXPECT_THAT(tool({"name"}).output, Not(HasSubstr("paged:")));
}

TEST_F(Pager, isNotUsedWithoutATerminalOrWithTheOption) {
    EXPECT_THAT(tool({"list", "--no-pager"}).output, Not(HasSubstr("paged:")));
    settings_.environment["TERM"] = "dumb";
    EXPECT_THAT(tool({"list"}).output, Not(HasSubstr("paged:")));
    settings_.onTerminal = false;
    settings_.environment["TERM"] = "xterm";
    EXPECT_THAT(tool({"list"}), Prints("a.txt\n"));
}

TEST_F(Pager, isTheVariableWithPrecedence) {
    settings_.environment["PAGER"] = "sed 's/^/other:/'";
    EXPECT_THAT(tool({"list"}).output, HasSubstr("paged:a.txt"));
    settings_.environment["PROJECTCTL_PAGER"] = "";
    EXPECT_THAT(tool({"list"}).output, ::testing::StartsWith("a.txt"));
    settings_.environment.erase("PROJECTCTL_PAGER");
    EXPECT_THAT(tool({"list"}).output, HasSubstr("other:a.txt"));
    settings_.environment["PAGER"] = "cat";
    EXPECT_THAT(tool({"list"}).output, ::testing::StartsWith("a.txt"));
}

TEST_F(Pager, getsTheOptionsOfLessUnlessTheyAreSet) {
    settings_.environment["PROJECTCTL_PAGER"] = "cat >/dev/null; echo \"<$LESS>\"";
    EXPECT_THAT(tool({"list"}).output, HasSubstr("<FRX>"));
    settings_.environment["LESS"] = "S";
    EXPECT_THAT(tool({"list"}).output, HasSubstr("<S>"));
}

TEST_F(Pager, doesNotChangeTheExitCodeOrTheError) {
    settings_.environment["NO_COLOR"] = "1";
    auto const result = tool({"list", "missing"});
    EXPECT_EQ(result.exitCode, 1);
    EXPECT_THAT(result.output, HasSubstr("projectctl: "));
}

TEST_F(Pager, mayEndBeforeTheOutput) {
    settings_.environment["PROJECTCTL_PAGER"] = "true";
    auto const result = tool({"list"});
    EXPECT_THAT(result.output, Not(HasSubstr("projectctl:")));
}

TEST_F(Pager, isNotNeededToConfirmAChangeWhichQuietSuppresses) {
    folder_.addFile("b.txt");
    folder_.addFile("c.txt");
    EXPECT_THAT(tool({"add", "b.txt"}).output, HasSubstr("added"));
    EXPECT_EQ(tool({"add", "c.txt", "--quiet"}).output, "");
}

} // namespace
} // namespace project::test
