#include "ToolTest.hpp"
#include "support/GitFolder.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::Not;

/// A project in a git repository that merges texts by the tool under test.
class MergeCommand : public ToolTest {
protected:
    void SetUp() override {
        settings_.environment["PATH"] = pathWithTool;
        initProject();
        for (auto const* name : {u"a", u"b", u"c"}) {
            folder_.file(name);
        }
        ASSERT_THAT(tool({"add", "a", "b", "c"}), SucceedsSilently());
        ASSERT_THAT(tool({"category", "create", "Status", "--single-valued"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Open"}), SucceedsSilently());
        ASSERT_THAT(tool({"label", "create", "Status", "Done"}), SucceedsSilently());
        commit("the project");
    }

    /// Commits what the tool has staged.
    void commit(std::string const& message) const { git_.run({"commit", "-q", "-m", message}); }

    /// Does one thing on a branch of its own, another on the main branch, and merges.
    ProgramResult mergeOf(std::vector<std::string> const& theirs,
                          std::vector<std::string> const& ours) const {
        git_.run({"switch", "-q", "-c", "hers"});
        EXPECT_THAT(tool(theirs), SucceedsSilently());
        commit("hers");
        git_.run({"switch", "-q", "-f", "main"});
        EXPECT_THAT(tool(ours), SucceedsSilently());
        commit("his");
        return git_.tryTo({"merge", "-q", "-m", "both", "hers"});
    }

    std::string const pathWithTool =
        std::filesystem::path(PROJECTCTL).parent_path().string() + ":/usr/bin:/bin";
    GitFolder const git_{folder_.onDisk(), {{"PATH", pathWithTool}}};
};

TEST_F(MergeCommand, bringsTogetherWhatTwoPeopleDidToOneFile) {
    ASSERT_THAT(tool({"category", "create", "Owner"}), SucceedsSilently());
    ASSERT_THAT(tool({"label", "create", "Owner", "Ann"}), SucceedsSilently());
    commit("owners");

    auto const merged =
        mergeOf({"label", "put", "Owner", "Ann", "a"}, {"label", "put", "Status", "Done", "a"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(linesOf(tool({"label", "show", "a"}).output),
                ::testing::UnorderedElementsAre("Owner: Ann", "Status: Done"));
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

TEST_F(MergeCommand, mergesNeighbouringLinesThatGitAloneWouldNot) {
    folder_.file(u"d");
    folder_.file(u"e");

    auto const merged = mergeOf({"add", "d"}, {"add", "e"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(list(), ::testing::ElementsAre("a", "b", "c", "d", "e"));
}

TEST_F(MergeCommand, leavesWhatOneSideRemovedRemoved) {
    folder_.file(u"d");

    auto const merged = mergeOf({"remove", "b"}, {"add", "d"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(list(), ::testing::ElementsAre("a", "c", "d"));
}

TEST_F(MergeCommand, leavesATrueConflictToAPersonInWordsOfTheProject) {
    auto const merged = mergeOf({"name", "Pump"}, {"name", "Valve"});

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.errors,
                HasSubstr("projectctl: conflict in .projectdata/project.jsonl: the \"Name\" of "));
    EXPECT_THAT(merged.errors, HasSubstr(" is set to \"Valve\" by ours and set to \"Pump\" by theirs"));
    EXPECT_THAT(readText(), AllOf(HasSubstr("<<<<<<< "), HasSubstr(">>>>>>> ")));
    EXPECT_THAT(tool({"add", "a"}), FailsWith(1, "project.jsonl"));
    EXPECT_EQ(tool({"list"}).output, "a\nb\nc\n");
}

TEST_F(MergeCommand, namesTheFileThatOneSideLabelledAndTheOtherRemoved) {
    auto const merged = mergeOf({"remove", "b"}, {"label", "put", "Status", "Done", "b"});

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.errors, HasSubstr(": the file \"b\" is removed by theirs and changed by ours\n"));
}

TEST_F(MergeCommand, marksOnlyWhatIsInConflict) {
    folder_.file(u"d");
    git_.run({"switch", "-q", "-c", "hers"});
    ASSERT_THAT(tool({"name", "Pump"}), SucceedsSilently());
    ASSERT_THAT(tool({"add", "d"}), SucceedsSilently());
    commit("hers");
    git_.run({"switch", "-q", "-f", "main"});
    ASSERT_THAT(tool({"name", "Valve"}), SucceedsSilently());
    ASSERT_THAT(tool({"remove", "a"}), SucceedsSilently());
    commit("his");

    EXPECT_EQ(git_.tryTo({"merge", "-q", "-m", "both", "hers"}).exitCode, 1);

    EXPECT_EQ(tool({"list"}).output, "b\nc\nd\n");
}

TEST_F(MergeCommand, mergesProjectsThatBothSidesMade) {
    git_.run({"switch", "-q", "--orphan", "hers"});
    ASSERT_THAT(tool({"init", "--name", "Engine"}), SucceedsSilently());
    folder_.file(u"x");
    ASSERT_THAT(tool({"add", "x"}), SucceedsSilently());
    commit("hers");
    git_.run({"switch", "-q", "--orphan", "his"});
    ASSERT_THAT(tool({"init", "--name", "Engine"}), SucceedsSilently());
    folder_.file(u"y");
    ASSERT_THAT(tool({"add", "y"}), SucceedsSilently());
    commit("his");

    auto const merged = git_.tryTo({"merge", "-q", "--allow-unrelated-histories", "-m", "both", "hers"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(list(), ::testing::ElementsAre("x", "y"));
}

TEST_F(MergeCommand, changesNothingWhenAVersionCannotBeRead) {
    auto const good = readText();
    folder_.addFile("base", good);
    folder_.addFile("ours", good);
    folder_.addFile("theirs", good + "\"a");
    std::ofstream(inFolder("theirs")) << good.substr(0, good.size() / 2);

    EXPECT_THAT(tool({"merge", "base", "ours", "theirs"}), FailsWith(1, "theirs"));
    EXPECT_THAT(tool({"merge", "base", "ours", "nowhere"}), FailsWith(1, "\"nowhere\" cannot be read"));

    std::ifstream ours(inFolder("ours"));
    EXPECT_EQ(std::string(std::istreambuf_iterator<char>(ours), {}), good);
}

TEST_F(MergeCommand, takesAnEmptyBaseForNone) {
    folder_.addFile("base");
    folder_.addFile("ours", readText());
    folder_.addFile("theirs", readText());

    EXPECT_THAT(tool({"merge", "base", "ours", "theirs"}), SucceedsSilently());
}

class ResolveCommand : public MergeCommand {
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

TEST_F(ResolveCommand, keepsOursOfAllThatBothChanged) {
    makeConflicts();

    ASSERT_THAT(tool({"resolve", "--ours"}), SucceedsSilently());

    EXPECT_THAT(tool({"name"}), Prints("Valve\n"));
    EXPECT_THAT(tool({"label", "show", "b"}), Prints("Status: Done\n"));
    EXPECT_THAT(tool({"check"}), SucceedsSilently());
    EXPECT_EQ(git_.run({"ls-files", "-u", ".projectdata"}), "");
}

TEST_F(ResolveCommand, takesTheirsOfAllThatBothChanged) {
    makeConflicts();

    ASSERT_THAT(tool({"resolve", "--theirs"}), SucceedsSilently());

    EXPECT_THAT(tool({"name"}), Prints("Pump\n"));
    EXPECT_THAT(list(), ::testing::ElementsAre("a", "c"));
}

TEST_F(ResolveCommand, listsWhatIsToBeChosenWhereNobodyCanBeAsked) {
    makeConflicts();
    auto const before = readText();

    auto const result = tool({"resolve"});

    EXPECT_EQ(result.exitCode, 1);
    EXPECT_THAT(result.errors,
                AllOf(HasSubstr("conflict: the file \"b\" is removed by theirs and changed by ours\n"),
                      HasSubstr("both sides changed 2 things. Give --ours or --theirs")));
    EXPECT_EQ(readText(), before);
}

TEST_F(ResolveCommand, asksForEachThingThatBothChangedOnATerminal) {
    makeConflicts();
    settings_.onTerminal = true;
    settings_.inputOnTerminal = true;

    auto const result = tool({"resolve"}, "what\nt\no\n");

    EXPECT_EQ(result.exitCode, 0) << result.output;
    EXPECT_THAT(result.output,
                AllOf(HasSubstr("1 of 2: the file \"b\" is removed by theirs and changed by ours."),
                      HasSubstr("2 of 2: the \"Name\" of "),
                      HasSubstr("The project's text is whole again.")));
    settings_ = {};
    settings_.folder = folder_.onDisk();
    EXPECT_THAT(tool({"name"}), Prints("Valve\n"));
    EXPECT_THAT(list(), ::testing::ElementsAre("a", "c"));
}

TEST_F(ResolveCommand, changesNothingForWhoeverThinksBetterOfIt) {
    makeConflicts();
    auto const before = readText();
    settings_.onTerminal = true;
    settings_.inputOnTerminal = true;

    EXPECT_EQ(tool({"resolve"}, "t\nq\n").exitCode, 1);

    EXPECT_EQ(readText(), before);
}

TEST_F(ResolveCommand, worksFromTheVersionsThatGitKeepsAlsoWhereGitMergedTheLines) {
    git_.run({"config", "--remove-section", "merge.project-definition"});
    folder_.file(u"d");
    folder_.file(u"e");
    ASSERT_EQ(mergeOf({"add", "d"}, {"add", "e"}).exitCode, 1);

    ASSERT_THAT(tool({"resolve"}), SucceedsSilently());

    EXPECT_THAT(list(), ::testing::ElementsAre("a", "b", "c", "d", "e"));
    EXPECT_EQ(git_.run({"status", "--porcelain", "--untracked-files=no"}).substr(0, 2), "M ");
}

TEST_F(ResolveCommand, hasNothingToDoWithoutAConflict) {
    EXPECT_THAT(tool({"resolve"}), FailsWith(1, "git has no conflict of the project's text"));
    EXPECT_THAT(tool({"resolve", "--ours", "--theirs"}), FailsWith(2, "excludes"));
}

TEST_F(ResolveCommand, leavesATextAloneThatSomebodyHasSettledAlready) {
    makeConflicts();
    auto const settled = git_.run({"show", ":2:.projectdata/project.jsonl"});
    writeText(settled);

    EXPECT_THAT(tool({"resolve", "--theirs"}), FailsWith(1, "the text has no markers of a merge"));

    EXPECT_EQ(readText(), settled);
}

class SetupCommand : public MergeCommand {};

TEST_F(SetupCommand, isDoneByInit) {
    EXPECT_EQ(git_.run({"config", "merge.project-definition.driver"}), "projectctl merge %O %A %B %P\n");
}

TEST_F(SetupCommand, isAskedForByStatusInAFreshClone) {
    git_.run({"config", "--remove-section", "merge.project-definition"});

    EXPECT_THAT(tool({"status"}).output,
                HasSubstr("note git merges the project's text line by line: 'projectctl "
                          "setup'"));
    EXPECT_THAT(tool({"status", "--no-source-control"}), SucceedsSilently());
    ASSERT_THAT(tool({"setup"}), SucceedsSilently());
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
    EXPECT_EQ(git_.run({"config", "merge.project-definition.driver"}), "projectctl merge %O %A %B %P\n");
}

TEST_F(SetupCommand, isLeftOutByInitThatLeavesGitAlone) {
    folder_.addFolder("other");
    git_.run({"config", "--remove-section", "merge.project-definition"});

    ASSERT_THAT(tool({"init", "other", "--no-source-control"}), SucceedsSilently());

    EXPECT_NE(git_.tryTo({"config", "merge.project-definition.driver"}).exitCode, 0);
}

class SetupOutsideAnyRepository : public ToolTest {};

TEST_F(SetupOutsideAnyRepository, isAnError) {
    initProject();

    EXPECT_THAT(tool({"setup"}), FailsWith(1, "is in no git repository"));
    EXPECT_THAT(tool({"status"}), SucceedsSilently());
}

} // namespace
} // namespace project::test
