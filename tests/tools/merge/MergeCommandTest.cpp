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
