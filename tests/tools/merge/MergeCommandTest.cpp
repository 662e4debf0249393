#include "tools/merge/MergingProject.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;

class MergeCommand : public MergingProject {};

TEST_F(MergeCommand, combinesTheChangesOfTwoPeopleToOneFile) {
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

TEST_F(MergeCommand, mergesNeighbouringLinesThatGitAloneCannotMerge) {
    folder_.file(u"d");
    folder_.file(u"e");

    auto const merged = mergeOf({"add", "d"}, {"add", "e"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(list(), ::testing::ElementsAre("a", "b", "c", "d", "e"));
}

TEST_F(MergeCommand, keepsARemoval) {
    folder_.file(u"d");

    auto const merged = mergeOf({"remove", "b"}, {"add", "d"});

    EXPECT_EQ(merged.exitCode, 0) << merged.output << merged.errors;
    EXPECT_THAT(list(), ::testing::ElementsAre("a", "c", "d"));
}

TEST_F(MergeCommand, reportsAConflictInTermsOfTheProject) {
    auto const merged = mergeOf({"name", "Pump"}, {"name", "Valve"});

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.errors,
                HasSubstr("projectctl: conflict in .projectdata/project.jsonl: the \"Name\" of "));
    EXPECT_THAT(merged.errors, HasSubstr(" is set to \"Valve\" by ours and set to \"Pump\" by theirs"));
    EXPECT_THAT(readText(), AllOf(HasSubstr("<<<<<<< "), HasSubstr(">>>>>>> ")));
    EXPECT_THAT(tool({"add", "a"}), FailsWith(6, "project.jsonl"));
    EXPECT_EQ(tool({"list"}).output, "a\nb\nc\n");
}

TEST_F(MergeCommand, namesTheFileThatOneSideLabelledAndTheOtherRemoved) {
    auto const merged = mergeOf({"remove", "b"}, {"label", "put", "Status", "Done", "b"});

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.errors, HasSubstr(": the file \"b\" is removed by theirs and changed by ours\n"));
}

TEST_F(MergeCommand, putsMarkersAroundConflictsOnly) {
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

TEST_F(MergeCommand, mergesProjectsThatBothSidesCreated) {
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

/// Two branches that have merged each other. Each of them has resolved the conflict between them.
class CrissCrossHistory : public MergingProject {
protected:
    void mergeEachOther(std::vector<std::string> const& theirs, std::vector<std::string> const& ours) const {
        ASSERT_EQ(mergeOf(theirs, ours).exitCode, 1);
        git_.run({"branch", "his", "main"});
    }

    /// @param choice of the branch that is checked out, which has the merge in progress.
    void resolve(std::string const& choice) const {
        ASSERT_THAT(tool({"resolve", choice}), SucceedsSilently());
        commit("resolved");
    }

    void resolveOnBothBranches(std::string const& hisChoice, std::string const& herChoice) const {
        resolve(hisChoice);
        git_.run({"switch", "-q", "hers"});
        ASSERT_EQ(git_.tryTo({"merge", "-q", "-m", "both", "his"}).exitCode, 1);
        resolve(herChoice);
    }

    ProgramResult mergeHersIntoHis() const {
        git_.run({"switch", "-q", "-f", "main"});
        EXPECT_THAT(linesOf(git_.run({"merge-base", "--all", "main", "hers"})), ::testing::SizeIs(2));
        return git_.tryTo({"merge", "-q", "-m", "again", "hers"});
    }
};

TEST_F(CrissCrossHistory, isMergedIfBothBranchesResolvedTheConflictAlike) {
    folder_.file(u"d");
    mergeEachOther({"name", "Pump"}, {"name", "Valve"});
    resolveOnBothBranches("--ours", "--theirs");
    ASSERT_THAT(tool({"remove", "c"}), SucceedsSilently());
    commit("hers again");
    git_.run({"switch", "-q", "-f", "main"});
    ASSERT_THAT(tool({"add", "d"}), SucceedsSilently());
    commit("his again");

    auto const merged = mergeHersIntoHis();

    EXPECT_EQ(merged.exitCode, 0) << merged.errors;
    EXPECT_THAT(tool({"name"}), Prints("Valve\n"));
    EXPECT_THAT(list(), ::testing::ElementsAre("a", "b", "d"));
}

TEST_F(CrissCrossHistory, hasAConflictIfTheBranchesResolvedItDifferently) {
    mergeEachOther({"name", "Pump"}, {"name", "Valve"});
    resolveOnBothBranches("--ours", "--ours");

    auto const merged = mergeHersIntoHis();

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.errors, HasSubstr(" is set to \"Valve\" by ours and set to \"Pump\" by theirs"));
    ASSERT_THAT(tool({"resolve", "--theirs"}), SucceedsSilently());
    EXPECT_THAT(tool({"name"}), Prints("Pump\n"));
}

TEST_F(CrissCrossHistory, neitherLosesNorRestoresAFileThatOneBranchKept) {
    mergeEachOther({"remove", "b"}, {"label", "put", "Status", "Done", "b"});
    resolveOnBothBranches("--ours", "--ours");

    auto const merged = mergeHersIntoHis();

    EXPECT_EQ(merged.exitCode, 1);
    EXPECT_THAT(merged.errors, HasSubstr(": the file \"b\" is removed by theirs and changed by ours\n"));
    ASSERT_THAT(tool({"resolve", "--ours"}), SucceedsSilently());
    EXPECT_THAT(tool({"label", "show", "b"}), Prints("Status: Done\n"));
}

TEST_F(MergeCommand, changesNothingWhenAVersionCannotBeRead) {
    auto const good = readText();
    folder_.addFile("base", good);
    folder_.addFile("ours", good);
    folder_.addFile("theirs", good + "\"a");
    std::ofstream(inFolder("theirs")) << good.substr(0, good.size() / 2);

    EXPECT_THAT(tool({"merge", "base", "ours", "theirs"}), FailsWith(129, "theirs"));
    EXPECT_THAT(tool({"merge", "base", "ours", "nowhere"}), FailsWith(129, "\"nowhere\" cannot be read"));

    std::ifstream ours(inFolder("ours"));
    EXPECT_EQ(std::string(std::istreambuf_iterator<char>(ours), {}), good);
}

TEST_F(MergeCommand, changesNothingWhereTheResultCannotBeWritten) {
    auto const good = readText();
    for (auto const* name : {"base", "ours", "theirs"}) {
        folder_.addFile(name, good);
    }
    settings_.fileSize = 10; // a full disk

    EXPECT_THAT(tool({"merge", "base", "ours", "theirs"}), FailsWith(129, "\"ours\" cannot be written"));

    EXPECT_FALSE(std::filesystem::exists(inFolder("ours.merged")));
    std::ifstream ours(inFolder("ours"));
    EXPECT_EQ(std::string(std::istreambuf_iterator<char>(ours), {}), good);
}

TEST_F(MergeCommand, namesTheResultInAConflictWithoutAPath) {
    auto const good = readText();
    ASSERT_THAT(tool({"name", "Pump"}), SucceedsSilently());
    folder_.addFile("ours", readText());
    ASSERT_THAT(tool({"name", "Valve"}), SucceedsSilently());
    folder_.addFile("theirs", readText());
    folder_.addFile("base", good);

    auto const result = tool({"merge", "base", "ours", "theirs"});

    EXPECT_EQ(result.exitCode, 1);
    EXPECT_THAT(result.errors, ::testing::StartsWith("projectctl: conflict in ours: the \"Name\" of "));
}

TEST_F(MergeCommand, acceptsAnEmptyBase) {
    folder_.addFile("base");
    folder_.addFile("ours", readText());
    folder_.addFile("theirs", readText());

    EXPECT_THAT(tool({"merge", "base", "ours", "theirs"}), SucceedsSilently());
}

} // namespace
} // namespace project::test
