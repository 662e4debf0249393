#include <csignal>
#include <filesystem>

#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

/// A project with the files "a", "b" and "c", of which "a" has the label "Open". They are committed in a git
/// repository.
class BatchCommand : public ToolTest {
protected:
    void SetUp() override {
        initProject();
        for (auto const* name : {u"a", u"b", u"c"}) {
            folder_.file(name);
        }
        ASSERT_THAT(batch("add a b c\ncategory create Status --single-valued\nlabel create Status Open\n"
                          "label create Status Done\nlabel put Status Open a\n"),
                    SucceedsSilently());
        git_.commitAll();
        folder_.file(u"src/io/pump.cpp", "pump"); // git does not know it
    }

    ProgramResult batch(std::string const& commands) const { return tool({"batch"}, commands); }

    std::string index() const {
        std::ifstream file(folder_.onDisk() / ".git" / "index", std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    std::string status() const { return git_.run({"status", "--porcelain", "--untracked-files=no"}); }

    std::string staged() const { return git_.run({"show", ":.projectdata/project.jsonl"}); }

    /// Expects that a batch fails, and that neither the project nor git's index changes.
    void expectRefused(std::string const& commands, int exitCode, std::string const& error) const {
        auto const textBefore = readText();
        auto const indexBefore = index();
        EXPECT_THAT(batch(commands), FailsWith(exitCode, error)) << commands;
        EXPECT_EQ(readText(), textBefore) << commands;
        EXPECT_EQ(index(), indexBefore) << commands;
    }

    ProgramSettings withOpenInput() const {
        auto settings = settings_;
        settings.inputStaysOpen = true;
        return settings;
    }

    GitFolder const git_{folder_.onDisk()};
};

TEST_F(BatchCommand, runsItsLinesAsOneStepThatIsStaged) {
    EXPECT_THAT(batch("# the pump\nadd src/io/pump.cpp\nlabel put Status Done src/io/pump.cpp\n\n"
                      "remove b\nname 'The pump'"),
                SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("a", "c", "src", "src/io", "src/io/pump.cpp"));
    EXPECT_THAT(tool({"label", "find", "Status", "Done"}), Prints("src/io/pump.cpp\n"));
    EXPECT_THAT(tool({"name"}), Prints("The pump\n"));
    EXPECT_EQ(status(), "M  .projectdata/project.jsonl\nD  b\nA  src/io/pump.cpp\n");
    EXPECT_EQ(staged(), readText());
}

TEST_F(BatchCommand, letsEachLineSeeTheChangesOfThoseBeforeIt) {
    EXPECT_THAT(batch("remove c\nadd -r src\nlist\nlabel put Status Done a b\nlabel find Status Done\n"
                      "label show a\nstatus\nlist --tree src\nname New\nname\nentry set a\nentry list\n"),
                Prints("a\nb\nsrc\nsrc/io\nsrc/io/pump.cpp\na\nb\nStatus: Done\nnew  c\nsrc/\n  io/\n"
                       "    pump.cpp\nNew\na: Basic, a\n"));
}

TEST_F(BatchCommand, readsAFile) {
    folder_.file(u"commands", "remove a\n");
    folder_.file(u"src/more", "remove ../b\n");

    EXPECT_THAT(tool({"batch", "commands"}), SucceedsSilently());
    EXPECT_THAT(toolFrom("src", {"batch", "more"}), SucceedsSilently());
    EXPECT_THAT(tool({"batch", "-"}, "list"), Prints("c\n"));
    EXPECT_THAT(tool({"batch", "missing"}), FailsWith(1, "\"missing\" cannot be read"));
    EXPECT_THAT(tool({"batch", "src"}), FailsWith(1, "\"src\" cannot be read"));
}

TEST_F(BatchCommand, letsOneLineReadStandardInputIfTheCommandsAreInAFile) {
    folder_.file(u"commands", "remove -0\n");
    folder_.file(u"twice", "remove -0\nadd -\n");

    EXPECT_THAT(tool({"batch", "twice"}, withZeros({"a"})), FailsWith(2, "line 2: standard input"));
    EXPECT_THAT(tool({"batch", "commands"}, withZeros({"a", "b"})), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("c"));
}

TEST_F(BatchCommand, changesNothingIfALineInTheMiddleFails) {
    expectRefused("remove a\nadd src\n\nlist\nadd missing\nname X\n", 1,
                  "line 5: \"" + inFolder("missing") + '"');
    expectRefused("add src\nlabel put Status Nothing a\n", 1, "line 2: ");
    expectRefused("remove a\nremove a\n", 1, "(nothing was changed)");
    EXPECT_THAT(list(), ElementsAre("a", "b", "c"));
}

TEST_F(BatchCommand, runsNoLineIfOneIsUnknownOrHasWrongArguments) {
    expectRefused("remove a\nlsit\n", 2, "line 2: unknown command or option \"lsit\"");
    expectRefused("remove a\nlist --long\n", 2, "line 2: unknown option \"--long\"");
    expectRefused("remove a\n\nlabel put Status\n", 2, "line 3: ");
    expectRefused("remove a\nlist --help\n", 2, "line 2: ");
    expectRefused("remove a\nname \"X\n", 2, "line 2: a double quote is not closed");
}

TEST_F(BatchCommand, refusesCommandsThatAreNotAboutTheOpenProject) {
    for (auto const* command : {"init",
                                "root",
                                "setup",
                                "watch",
                                "tidy",
                                "resolve",
                                "merge a b c",
                                "check --repair",
                                "references --graph",
                                "batch",
                                "batch lines",
                                "report",
                                "log",
                                "diff",
                                "textconv a",
                                "copy --to team",
                                "shared status",
                                "shared log",
                                "shared roles",
                                "shared tidy"}) {
        expectRefused(std::string("remove a\n") + command, 2, "cannot be part of a batch");
    }
    for (auto const* command : {"-C src list", "list --full-name", "add a --no-source-control"}) {
        expectRefused(std::string("remove a\n") + command, 2, "applies to the whole batch");
    }
    for (auto const* command : {"add -0", "add -", "label put Status Open -0"}) {
        expectRefused(std::string("remove a\n") + command, 2, "line 2: standard input");
    }
}

TEST_F(BatchCommand, takesTheOptionsOfTheWholeBatchItself) {
    EXPECT_THAT(tool({"batch", "-C", "src/io", "--full-name"}, "add pump.cpp\nlist\n"),
                Prints("a\nb\nc\nsrc\nsrc/io\nsrc/io/pump.cpp\n"));
    EXPECT_THAT(tool({"--no-source-control", "batch"}, "remove src\n"), SucceedsSilently());
    EXPECT_THAT(status(), HasSubstr("A  src/io/pump.cpp\n"));
}

TEST_F(BatchCommand, takesNamesOfAnyBytes) {
    for (auto const* name :
         {"two\nlines", "a b", "it's", "\"x\"", "\\", "-0", "--help", "#", "\x80\xFF", "$x"}) {
        folder_.addFile(name);
    }

    EXPECT_THAT(
        batch("add 'two\nlines' a\\ b \"it's\" '\"x\"' \\\\ -- -0 --help '#' \x80\xFF $x\nremove a b c\n"),
        SucceedsSilently());

    EXPECT_THAT(tool({"list", "-0"}), Prints(withZeros({"\"x\"", "#", "$x", "--help", "-0", "\\", "a b",
                                                        "it's", "two\nlines", "\x80\xFF"})));
}

TEST_F(BatchCommand, changesNothingIfTheIndexIsLocked) {
    folder_.addFile(".git/index.lock");

    expectRefused("label put Status Done b\nadd src\nremove a\n", 4, inFolder(".git/index.lock"));
    expectRefused("remove a\n", 4, "(nothing was changed)");

    std::filesystem::remove(inFolder(".git/index.lock"));
    EXPECT_THAT(batch("remove a"), SucceedsSilently());
}

TEST_F(BatchCommand, changesNothingIfTheTextIsDamaged) {
    insertLineBefore("\"b\"", "{\"file\":");

    auto const textBefore = readText();
    auto const result = batch("name X\n");

    EXPECT_EQ(result.exitCode, 5);
    EXPECT_THAT(linesOf(result.errors),
                ElementsAre(HasSubstr("warning: "), HasSubstr(text().string() + ":")));
    EXPECT_EQ(readText(), textBefore);
}

TEST_F(BatchCommand, waitsForAnotherProcessThatHasLockedTheProject) {
    RunningProgram holder({"flock", ".projectdata", "sh", "-c", "echo held; read line"}, withOpenInput());
    ASSERT_EQ(holder.readLine(), "held");
    folder_.file(u"commands", "remove a\nadd src\n");
    RunningProgram running(commandFor({"batch", "commands"}), settings_);
    ASSERT_TRUE(running.waitUntilItSleeps());
    EXPECT_THAT(list(), ElementsAre("a", "b", "c"));

    holder.finish("\n");

    EXPECT_THAT(running.finish(), SucceedsSilently());
    EXPECT_THAT(list(), ElementsAre("b", "c", "src"));
}

TEST_F(BatchCommand, givesUpIfTheProjectRemainsLocked) {
    RunningProgram holder({"flock", ".projectdata", "sh", "-c", "echo held; read line"}, withOpenInput());
    ASSERT_EQ(holder.readLine(), "held");

    expectRefused("remove a\n", 4, "lock");

    holder.finish("\n");
}

TEST_F(BatchCommand, takesNoLockWhileItReadsTheCommands) {
    RunningProgram reading(commandFor({"batch"}), withOpenInput());
    ASSERT_TRUE(reading.waitUntilItSleeps());

    EXPECT_THAT(tool({"remove", "b"}), SucceedsSilently());

    EXPECT_THAT(reading.finish("remove a\n"), SucceedsSilently());
    EXPECT_THAT(list(), ElementsAre("c"));
}

TEST_F(BatchCommand, isInTheProjectAsAWholeOrNotAtAllAfterCtrlC) {
    std::string commands;
    for (int number = 0; number < 300; ++number) {
        auto const file = "folder/file" + std::to_string(number);
        folder_.addFile(file);
        commands += "add " + file + "\nlabel put Status Open " + file + '\n';
    }
    folder_.file(u"commands", commands);
    auto const before = list().size();
    for (useconds_t wait = 0; wait < 200'000; wait += 5'000) {
        RunningProgram running(commandFor({"batch", "commands"}), settings_);
        usleep(wait);
        running.sendSignal(SIGINT);
        running.finish();

        auto const listed = list().size();

        EXPECT_TRUE(listed == before || listed == before + 301) << listed;
        EXPECT_THAT(tool({"check", "--no-source-control"}).output, ::testing::Not(HasSubstr("folder")));
        if (listed > before) {
            return;
        }
    }
}

TEST_F(BatchCommand, isNotStoppedByAFindingAndReturnsIt) {
    std::filesystem::remove(inFolder("a"));
    insertLineBefore("\"b\"", "\"lost/file\"");

    auto const result = batch("remove c\ncheck\nname New\n");

    EXPECT_EQ(result.exitCode, 3);
    EXPECT_THAT(result.output, HasSubstr("lost/file"));
    EXPECT_EQ(result.errors, "");
    EXPECT_THAT(tool({"name"}), Prints("New\n"));
    EXPECT_THAT(list(), ElementsAre("a", "b"));
}

TEST_F(BatchCommand, keepsAFileInGitThatItRemovesAndAddsAgain) {
    EXPECT_THAT(batch("remove a\nadd a\nlabel put Status Open a\n"), SucceedsSilently());

    EXPECT_THAT(list(), ElementsAre("a", "b", "c"));
    EXPECT_EQ(status(), "");
}

TEST_F(BatchCommand, keepsAFolderInGitThatItRemovesAndAddsAgain) {
    ASSERT_THAT(batch("add -r src\n"), SucceedsSilently());
    git_.commitAll();

    EXPECT_THAT(batch("remove src\nadd -r src\n"), SucceedsSilently());

    EXPECT_EQ(status(), "");
}

TEST_F(BatchCommand, doesNotStageAFileThatItAddsAndRemovesAgain) {
    EXPECT_THAT(batch("add src/io/pump.cpp\nremove src\n"), SucceedsSilently());
    EXPECT_EQ(status(), "");
    ASSERT_THAT(batch("remove a"), SucceedsSilently());

    EXPECT_THAT(batch("add a\nremove a\n"), SucceedsSilently());

    EXPECT_EQ(status(), "M  .projectdata/project.jsonl\nD  a\n");
}

TEST_F(BatchCommand, withoutCommandsDoesNothing) {
    auto const before = readText();

    EXPECT_THAT(batch(""), SucceedsSilently());
    EXPECT_THAT(batch("# nothing\n\n"), SucceedsSilently());

    EXPECT_EQ(readText(), before);
}

TEST_F(BatchCommand, confirmsOnATerminalTheWholeBatchAlone) {
    folder_.file(u"commands", "remove a\nlabel put Status Open b c\n");
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"batch", "commands"}).output, "2 commands done\r\n");
}

TEST_F(BatchCommand, needsAProject) {
    EXPECT_THAT(tool({"batch", "-C", "/"}, "list\n"), FailsWith(1, "no project"));
}

} // namespace
} // namespace project::test
