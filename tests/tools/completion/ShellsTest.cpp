#include "tools/completion/CompletionTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

std::string completions(std::string const& name) {
    return std::string(PROJECTCTL_COMPLETIONS) + '/' + name;
}

/// Completion in the shells themselves, which call the tool.
class Shells : public CompletionTest {
protected:
    void SetUp() override {
        CompletionTest::SetUp();
        std::filesystem::copy_file(completions("projectctl.zsh"),
                                   home_.addFolder("functions") / "_projectctl");
        settings_.environment["HOME"] = home_.onDisk().string();
        auto const tools = std::filesystem::path(PROJECTCTL).parent_path().string();
        settings_.environment["PATH"] = tools + ":/usr/bin:/bin";
    }

    /// Calls the function of bash as bash does. @param replaced the end of the line that bash replaces.
    Lines bash(std::string const& line, std::string const& replaced) const {
        auto const result =
            runProgram({"/bin/bash", "--noprofile", "--norc", "-c",
                        "source \"$1\"; COMP_LINE=$2; COMP_POINT=${#2}; _projectctl projectctl \"$3\" '';"
                        "((${#COMPREPLY[@]} == 0)) || printf '%s\\0' \"${COMPREPLY[@]}\"",
                        "bash", completions("projectctl.bash"), line, replaced},
                       settings_);
        return partsOf(withoutOption(result));
    }

    /// Asks fish for the completions of a line. A value in fish may contain a line end.
    Lines fish(std::string const& line) const {
        auto const result =
            runProgram({"/usr/bin/fish", "--no-config", "-c",
                        "source $argv[1]; for each in (complete --do-complete $argv[2] | string "
                        "collect); printf '%s\\0' $each; end",
                        "--", completions("projectctl.fish"), line},
                       settings_);
        EXPECT_EQ(result.errors, "");
        return partsOf(result.output);
    }

    /// Types lines in an interactive shell.
    void type(std::string const& shell, Lines const& lines) const {
        Lines command{"/usr/bin/zsh", "-f", PROJECTCTL_TYPE_IN_SHELL, shell, PROJECTCTL_COMPLETIONS};
        command.insert(command.end(), lines.begin(), lines.end());
        auto const result = runProgram(command, settings_);
        ASSERT_EQ(result.exitCode, 0) << result.errors;
    }

    void expectLabels() const {
        EXPECT_EQ(tool({"label", "show", "my dir/it's"}).output, "Status: Open\n");
        EXPECT_EQ(tool({"label", "show", "my dir/line\nbreak"}).output, "Status: Re \"viewed\n");
        EXPECT_EQ(tool({"label", "show", "src/a.cpp"}).output, "My Cat: one\ntwo\n");
        EXPECT_EQ(tool({"label", "show", "quo\"te"}).output, "My Cat: one\ntwo\n");
    }

    /// Puts labels on files, each of which is completed outside of quotes or inside.
    Lines const typed_{"projectctl labe\tpu\tSt\tOp\tmy\tit\t", "projectctl label put St\tRe\tmy\tli\t",
                       "projectctl label put 'My C\tone\tsrc/a\t", "projectctl label put \"My C\tone\tquo\t"};

private:
    /// Bash cannot change options outside of a completion, and says so.
    static std::string withoutOption(ProgramResult const& result) {
        EXPECT_TRUE(result.errors.empty() ||
                    result.errors.find("compopt: not currently executing") != std::string::npos)
            << result.errors;
        return result.output;
    }

    TemporaryFolder home_;
};

TEST_F(Shells, bashGetsQuotedValuesFromTheFunction) {
    EXPECT_THAT(bash("projectctl li", "li"), ElementsAre("list"));
    EXPECT_THAT(bash("projectctl label put ", ""), ElementsAre("My\\ Cat", "Status"));
    EXPECT_THAT(bash("projectctl label put My\\ Cat ", ""), ElementsAre("one'\n'two"));
    EXPECT_THAT(bash("projectctl label put Status R", "R"), ElementsAre("Re\\ \\\"viewed"));
    EXPECT_THAT(bash("projectctl list my\\ dir/", "my\\ dir/"),
                ElementsAre("my\\ dir/it\\'s", "my\\ dir/line'\n'break"));
    EXPECT_THAT(bash("projectctl list 'my dir/i", "my dir/i"), ElementsAre("my dir/it'\\''s"));
    EXPECT_THAT(bash("projectctl list \"q", "q"), ElementsAre("quo\\\"te"));
    EXPECT_THAT(bash("projectctl entry set --type=St", "St"), ElementsAre("Startup"));
    EXPECT_THAT(bash("LC_ALL=C projectctl li", "li"), ElementsAre("list"));
}

TEST_F(Shells, bashGetsNothingOnErrors) {
    EXPECT_THAT(bash("projectctl no-such-command ", ""), IsEmpty());
    std::filesystem::remove_all(text().parent_path());
    EXPECT_THAT(bash("projectctl list ", ""), IsEmpty());
    settings_.environment["PATH"] = "/usr/bin:/bin";
    EXPECT_THAT(bash("projectctl li", "li"), IsEmpty());
}

TEST_F(Shells, bashCompletesTypedLines) {
    type("bash", typed_);

    expectLabels();
}

TEST_F(Shells, zshCompletesTypedLines) {
    type("zsh", typed_);

    expectLabels();
}

TEST_F(Shells, zshWritesNothingOnErrors) {
    type("zsh", {"projectctl no-such-command \t; projectctl label put Status Open src/a.cpp"});

    EXPECT_EQ(tool({"label", "show", "src/a.cpp"}).output, "Status: Open\n");
}

TEST_F(Shells, fishOffersValuesWithDescriptions) {
    EXPECT_THAT(fish("projectctl li"), ElementsAre("list\tList the files and folders of the project"));
    EXPECT_THAT(fish("projectctl label put "), ElementsAre("My Cat\tcategory\nStatus\tcategory"));
    EXPECT_THAT(fish("projectctl label put My\\ Cat "), ElementsAre("one\ntwo\tlabel"));
    EXPECT_THAT(fish("projectctl label put 'My Cat' one\\ntwo q"), ElementsAre("quo\"te\tfile"));
    EXPECT_THAT(fish("projectctl list my\\ dir/i"), ElementsAre("my dir/it's\tfile"));
    EXPECT_THAT(fish("projectctl list 'my dir/l"), ElementsAre("my dir/line\nbreak\tfile"));
    EXPECT_THAT(fish("projectctl list my\\ dir/line\\nb"), ElementsAre("my dir/line\nbreak\tfile"));
    EXPECT_THAT(fish("projectctl entry set --type=St"), ElementsAre("--type=Startup\ttype of entry points"));
}

TEST_F(Shells, fishGetsNothingOnErrors) {
    EXPECT_THAT(fish("projectctl no-such-command "), IsEmpty());
    std::filesystem::remove_all(text().parent_path());
    EXPECT_THAT(fish("projectctl list "), IsEmpty());
}

} // namespace
} // namespace project::test
