#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::Not;

constexpr char const* escape = "\033[";

MATCHER(IsColored, "") {
    return arg.find(escape) != std::string::npos;
}

/// A project with a label and an entry point. TERM is that of a terminal with colours.
class Colors : public ToolTest {
protected:
    void SetUp() override {
        settings_.environment["TERM"] = "xterm";
        initProject();
        folder_.addFile("a.txt");
        folder_.addFile("b.txt");
        ASSERT_THAT(tool({"add", "a.txt", "b.txt"}), SucceedsSilently());
        ASSERT_THAT(tool({"category", "create", "Status"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "put", "Status", "Open", "a.txt"}), SucceedsSilently());
    }

    std::string labels(std::vector<std::string> more = {}) const {
        more.insert(more.begin(), {"label", "show", "a.txt", "b.txt"});
        return tool(more).output;
    }

    void onTerminal() { settings_.onTerminal = true; }
};

TEST_F(Colors, areWrittenOnATerminalOnly) {
    EXPECT_EQ(labels(), "a.txt: Status: Open\n");
    onTerminal();
    EXPECT_THAT(labels(), HasSubstr("\033[35ma.txt\033[m: Status: Open"));
}

TEST_F(Colors, areNotWrittenWithNoColor) {
    onTerminal();
    settings_.environment["NO_COLOR"] = "1";
    EXPECT_THAT(labels(), Not(IsColored()));
    settings_.environment["NO_COLOR"] = ""; // counts as not set
    EXPECT_THAT(labels(), IsColored());
}

TEST_F(Colors, areNotWrittenOnADumbTerminal) {
    onTerminal();
    settings_.environment["TERM"] = "dumb";
    EXPECT_THAT(labels(), Not(IsColored()));
}

TEST_F(Colors, areForcedByAVariableAlsoInAPipe) {
    settings_.environment["CLICOLOR_FORCE"] = "1";
    EXPECT_THAT(labels(), IsColored());
    settings_.environment["TERM"] = "dumb";
    EXPECT_THAT(labels(), IsColored());
    settings_.environment["CLICOLOR_FORCE"] = "0";
    EXPECT_THAT(labels(), Not(IsColored()));
}

TEST_F(Colors, areChosenInTheDocumentedOrder) {
    onTerminal();
    settings_.environment["NO_COLOR"] = "1";
    settings_.environment["CLICOLOR_FORCE"] = "1";
    EXPECT_THAT(labels(), Not(IsColored()));                 // NO_COLOR before CLICOLOR_FORCE
    EXPECT_THAT(labels({"--color", "always"}), IsColored()); // the option before both
    settings_.environment.erase("NO_COLOR");
    EXPECT_THAT(labels({"--color", "never"}), Not(IsColored()));
    EXPECT_THAT(labels({"--color=auto"}), IsColored());
}

TEST_F(Colors, areChosenByTheOptionAnywhereOnTheLine) {
    EXPECT_THAT(tool({"--color=always", "label", "show", "a.txt", "b.txt"}).output, IsColored());
    EXPECT_THAT(labels({"--color", "always"}), IsColored());
    EXPECT_THAT(labels({"--color", "always", "--color", "never"}), Not(IsColored())); // the last one
    EXPECT_THAT(tool({"list", "--color", "sometimes"}), FailsWith(2, "auto, always or never"));
    EXPECT_THAT(tool({"list", "--color"}), FailsWith(2, "--color needs"));
}

TEST_F(Colors, areNotPartOfJsonOrOfNamesThatEndWithZeroBytes) {
    auto const plain = tool({"list", "--json"}).output;
    EXPECT_EQ(tool({"list", "--json", "--color=always"}).output, plain);
    EXPECT_EQ(tool({"list", "-0", "--color=always"}).output, withZeros({"a.txt", "b.txt"}));
}

TEST_F(Colors, reachThePager) {
    onTerminal();
    settings_.environment["PROJECTCTL_PAGER"] = "cat -v";
    EXPECT_THAT(labels(), HasSubstr("^[[35ma.txt^[[m"));
}

TEST_F(Colors, markTheHeadingsOfHelp) {
    EXPECT_THAT(tool({"help", "list"}).output, Not(IsColored()));
    onTerminal();
    EXPECT_THAT(tool({"help", "list"}).output,
                AllOf(HasSubstr("\033[1mUsage:\033[m projectctl list"), HasSubstr("\033[1mOptions:\033[m")));
}

TEST_F(Colors, markFindingsBySeverity) {
    std::filesystem::remove(inFolder("a.txt"));
    folder_.addFile("new.txt");
    insertLineBefore(R"({"at":["Info","ProjectData"])", "\"lost/file\"");
    folder_.addFile("back\\slash");
    ASSERT_THAT(tool({"add", "back\\slash"}), SucceedsSilently());
    onTerminal();

    EXPECT_THAT(tool({"status"}).output,
                AllOf(HasSubstr("\033[32mnew \033[m new.txt"), HasSubstr("\033[31mgone\033[m a.txt"),
                      HasSubstr("\033[36mnote\033[m \"back")));
    EXPECT_THAT(tool({"check"}).output,
                AllOf(HasSubstr("\033[1;31m" + text().string() + ": \033[mthe file \"lost/file\""),
                      HasSubstr("\033[36m" + text().string() + ": note: \033[m\"back")));
    EXPECT_THAT(tool({"check", "--format", "gcc"}).output, Not(IsColored()));
}

TEST_F(Colors, markTheBeginningOfErrorsAndWarnings) {
    onTerminal();
    EXPECT_THAT(tool({"list", "missing"}).output, HasSubstr("\033[1;31mprojectctl:\033[m \""));
    ASSERT_EQ(tool({"category", "create", "Other"}).exitCode, 0);
    EXPECT_THAT(tool({"category", "rename", "Other", "Status"}).output,
                HasSubstr("\033[33mprojectctl: warning:\033[m 2 categories"));
    settings_.onTerminal = false;
    EXPECT_THAT(tool({"list", "missing"}).errors, Not(IsColored()));
}

} // namespace
} // namespace project::test
