#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;

class CommandLine : public ToolTest {};

TEST_F(CommandLine, showsHelp) {
    auto const result = tool({"--help"});

    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(result.errors, "");
    for (auto const* command : {"init", "name", "description", "add", "list", "status", "check", "tidy"}) {
        EXPECT_THAT(result.output, HasSubstr(std::string("\n  ") + command));
    }
}

TEST_F(CommandLine, showsTheHelpOfACommand) {
    auto const result = tool({"add", "--help"});

    EXPECT_EQ(result.exitCode, 0);
    EXPECT_THAT(result.output, HasSubstr("projectctl add [OPTIONS]"));
    EXPECT_THAT(result.output, HasSubstr("--recursive"));
}

TEST_F(CommandLine, showsItsVersion) {
    EXPECT_THAT(tool({"--version"}), Prints(PROJECTCTL_VERSION "\n"));
}

TEST_F(CommandLine, needsACommand) {
    EXPECT_THAT(tool({}), FailsWith(2, "projectctl --help"));
}

TEST_F(CommandLine, refusesAnUnknownCommand) {
    EXPECT_THAT(tool({"lsit"}), FailsWith(2, "\"lsit\""));
}

TEST_F(CommandLine, refusesAnUnknownOption) {
    EXPECT_THAT(tool({"list", "--long"}), FailsWith(2, "--long"));
    EXPECT_THAT(tool({"--long"}), FailsWith(2, "--long"));
}

TEST_F(CommandLine, refusesWrongArgumentsOutsideAProjectToo) {
    EXPECT_THAT(tool({"name", "a", "b"}), FailsWith(2, "projectctl name --help"));
}

TEST_F(CommandLine, acceptsNamesThatLookLikeOptionsOrLists) {
    initProject();
    std::vector<std::string> const names{"++",   "[]", "[a,b]", "[c",  "add",
                                         "list", "{}", "%%",    "a=b", "\x01[d]"};
    for (auto const& name : names) {
        folder_.addFile(name);
    }
    auto command = names;
    command.insert(command.begin(), "add");

    EXPECT_THAT(tool(command), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("\x01[d]", "%%", "++", "[]", "[a,b]", "[c", "a=b", "add", "list", "{}"));
}

TEST_F(CommandLine, acceptsNamesThatBeginWithADashAfterTwoDashes) {
    initProject();
    for (auto const* name : {"-r", "--", "--help", "-", "plain", "\x01-x"}) {
        folder_.addFile(name);
    }

    EXPECT_THAT(tool({"add", "plain", "\x01-x", "--", "-r", "--", "--help", "./-"}), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("\x01-x", "-", "--", "--help", "-r", "plain"));
}

TEST_F(CommandLine, acceptsTextsThatLookLikeOptionsOrLists) {
    initProject();
    for (auto const* name : {"[a,b]", "{}", "++", "add", "%%"}) {
        EXPECT_THAT(tool({"name", name}), SucceedsSilently());
        EXPECT_THAT(tool({"name"}), Prints(std::string(name) + '\n'));
    }
}

TEST_F(CommandLine, reportsAnErrorInOneLineWhateverTheNameContains) {
    initProject();

    EXPECT_THAT(tool({"add", "two\nlines\x1B[31m"}), FailsWith(1, "two\\nlines\\033[31m"));
    EXPECT_THAT(tool({"list", "--two\nlines"}), FailsWith(2, "--two\\nlines"));
}

TEST_F(CommandLine, reportsAnOutputThatCannotBeWritten) {
    initProject();
    RunningProgram shell({"sh", "-c", PROJECTCTL " name >/dev/full"}, settings_);

    EXPECT_THAT(shell.finish(), FailsWith(1, "the output cannot be written: No space left on device"));
}

} // namespace
} // namespace project::test
