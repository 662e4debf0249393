#include "tools/merge/MergingProject.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;

class ResolveCommand : public MergingProject {
protected:
    /// Both branches name the project, and label the file "a"; one removes "b", the other one labels it.
    void makeConflicts() const {
        git_.run({"switch", "-q", "-c", "hers"});
        ASSERT_THAT(tool({"name", "Pump"}), SucceedsSilently());
        ASSERT_THAT(tool({"remove", "b"}), SucceedsSilently());
        commit("hers");
        git_.run({"switch", "-q", "-f", "main"});
        ASSERT_THAT(tool({"name", "Valve"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "put", "Status", "Done", "b"}), SucceedsSilently());
        commit("his");
        ASSERT_EQ(git_.tryTo({"merge", "-q", "-m", "both", "hers"}).exitCode, 1);
    }
};

TEST_F(ResolveCommand, takesOursForAllConflicts) {
    makeConflicts();

    ASSERT_THAT(tool({"resolve", "--ours"}), SucceedsSilently());

    EXPECT_THAT(tool({"name"}), Prints("Valve\n"));
    EXPECT_THAT(tool({"label", "show", "b"}), Prints("Status: Done\n"));
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
    EXPECT_EQ(git_.run({"ls-files", "-u", ".projectdata"}), "");
}

TEST_F(ResolveCommand, takesTheirsForAllConflicts) {
    makeConflicts();

    ASSERT_THAT(tool({"resolve", "--theirs"}), SucceedsSilently());

    EXPECT_THAT(tool({"name"}), Prints("Pump\n"));
    EXPECT_THAT(list(), ::testing::ElementsAre("a", "c"));
}

TEST_F(ResolveCommand, listsTheConflictsWithoutATerminal) {
    makeConflicts();
    auto const before = readText();

    auto const result = tool({"resolve"});

    EXPECT_EQ(result.exitCode, 1);
    EXPECT_THAT(result.errors,
                AllOf(HasSubstr("conflict: the file \"b\" is removed by theirs and changed by ours\n"),
                      HasSubstr("2 conflicts to resolve. Use --ours or --theirs")));
    EXPECT_EQ(readText(), before);
}

TEST_F(ResolveCommand, asksForEachConflictOnATerminal) {
    makeConflicts();
    settings_.onTerminal = true;
    settings_.inputOnTerminal = true;

    auto const result = tool({"resolve"}, "what\nt\no\n");

    EXPECT_EQ(result.exitCode, 0) << result.output;
    EXPECT_THAT(result.output,
                AllOf(HasSubstr("1 of 2: the file \"b\" is removed by theirs and changed by ours."),
                      HasSubstr("2 of 2: the \"Name\" of "), HasSubstr("The conflicts are resolved.")));
    settings_ = {};
    settings_.folder = folder_.onDisk();
    EXPECT_THAT(tool({"name"}), Prints("Valve\n"));
    EXPECT_THAT(list(), ::testing::ElementsAre("a", "c"));
}

TEST_F(ResolveCommand, changesNothingAfterQuit) {
    makeConflicts();
    auto const before = readText();
    settings_.onTerminal = true;
    settings_.inputOnTerminal = true;

    EXPECT_EQ(tool({"resolve"}, "t\nq\n").exitCode, 1);

    EXPECT_EQ(readText(), before);
}

TEST_F(ResolveCommand, resolvesConflictsOfAMergeLineByLine) {
    git_.run({"config", "--remove-section", "merge.project-definition"});
    folder_.file(u"d");
    folder_.file(u"e");
    ASSERT_EQ(mergeOf({"add", "d"}, {"add", "e"}).exitCode, 1);

    ASSERT_THAT(tool({"resolve"}), SucceedsSilently());

    EXPECT_THAT(list(), ::testing::ElementsAre("a", "b", "c", "d", "e"));
    EXPECT_EQ(git_.run({"status", "--porcelain", "--untracked-files=no"}).substr(0, 2), "M ");
}

TEST_F(ResolveCommand, acceptsWholeWordsAsAnswers) {
    ASSERT_EQ(mergeOf({"name", "Pump"}, {"name", "Valve"}).exitCode, 1);
    settings_.onTerminal = true;
    settings_.inputOnTerminal = true;

    auto const result = tool({"resolve"}, "theirs\n");

    EXPECT_EQ(result.exitCode, 0) << result.output;
    settings_.onTerminal = false;
    settings_.inputOnTerminal = false;
    EXPECT_THAT(tool({"name"}), Prints("Pump\n"));
}

TEST_F(ResolveCommand, countsASingleConflict) {
    ASSERT_EQ(mergeOf({"name", "Pump"}, {"name", "Valve"}).exitCode, 1);

    EXPECT_THAT(tool({"resolve"}).errors,
                HasSubstr("projectctl: 1 conflict to resolve. Use --ours or --theirs"));
}

TEST_F(ResolveCommand, reportsATextThatCannotBeStaged) {
    makeConflicts();
    folder_.addFile(".git/index.lock");

    EXPECT_THAT(tool({"resolve", "--ours"}),
                FailsWith(1, "the conflict is resolved, but the text cannot be staged: fatal: "));

    EXPECT_THAT(readText(), ::testing::Not(HasSubstr("<<<<<<<")));
}

TEST_F(ResolveCommand, needsGit) {
    makeConflicts();
    settings_.environment["PATH"] = "/nowhere";

    EXPECT_THAT(tool({"resolve", "--ours"}),
                FailsWith(1, "the versions of the text cannot be read from git: "));
}

TEST_F(ResolveCommand, hasNothingToDoWithoutAConflict) {
    EXPECT_THAT(tool({"resolve"}), FailsWith(1, "git has no conflict of the project's text"));
    EXPECT_THAT(tool({"resolve", "--ours", "--theirs"}), FailsWith(2, "excludes"));
}

TEST_F(ResolveCommand, doesNotChangeATextThatIsAlreadyResolved) {
    makeConflicts();
    auto const settled = git_.run({"show", ":2:.projectdata/project.jsonl"});
    writeText(settled);

    EXPECT_THAT(tool({"resolve", "--theirs"}), FailsWith(1, "the text contains no conflict markers"));

    EXPECT_EQ(readText(), settled);
}

} // namespace
} // namespace project::test
