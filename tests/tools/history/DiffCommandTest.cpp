#include "tools/history/HistoryTest.hpp"

namespace project::test {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::Not;

class DiffCommand : public HistoryTest {};

TEST_F(DiffCommand, comparesTheLastCommitWithTheProjectAsItIs) {
    EXPECT_THAT(tool({"diff"}), SucceedsSilently());

    ASSERT_THAT(tool({"label", "put", "Status", "Done", "src/main.cpp"}), SucceedsSilently());
    ASSERT_THAT(tool({"entry", "set", "src/pump.cpp"}), SucceedsSilently());

    EXPECT_THAT(tool({"diff"}),
                Prints("take Status=Open src/main.cpp\nput Status=Done src/main.cpp\n"
                       "entry set src/pump.cpp GroupUUID=default Name=pump Type=Basic Visible=1\n"));
}

TEST_F(DiffCommand, comparesTwoCommits) {
    EXPECT_THAT(tool({"diff", "HEAD~1", "HEAD"}), Prints("put Status=Open src/main.cpp\n"));
    EXPECT_THAT(tool({"diff", "HEAD~1..HEAD"}), Prints("put Status=Open src/main.cpp\n"));
    EXPECT_THAT(tool({"diff", "HEAD~1.."}), Prints("put Status=Open src/main.cpp\n"));
    EXPECT_THAT(tool({"diff", "HEAD", "HEAD~1"}), Prints("take Status=Open src/main.cpp\n"));
}

TEST_F(DiffCommand, followsRenamesThatAreCommittedAndThoseThatAreNot) {
    renameSources();
    ASSERT_THAT(tool({"label", "put", "Status", "Done", "lib/pump.cpp"}), SucceedsSilently());
    auto const expected = "rename src lib\nput Status=Done lib/pump.cpp\n";

    EXPECT_THAT(tool({"diff"}), Prints(expected));
    commit("a rename");
    EXPECT_THAT(tool({"diff", "HEAD~1", "HEAD"}), Prints(expected));
}

TEST_F(DiffCommand, showsPathsFromTheCurrentFolder) {
    ASSERT_THAT(tool({"label", "put", "Status", "Done", "src/pump.cpp"}), SucceedsSilently());

    EXPECT_THAT(toolFrom("src", {"diff"}), Prints("put Status=Done pump.cpp\n"));
    EXPECT_THAT(toolFrom("src", {"diff", "--full-name"}), Prints("put Status=Done src/pump.cpp\n"));
}

TEST_F(DiffCommand, refusesWhatIsNotACommit) {
    EXPECT_THAT(tool({"diff", "nothing"}), FailsWith(1, "git knows no commit \"nothing\""));
}

TEST_F(DiffCommand, writesJson) {
    auto const diff = tool({"diff", "HEAD~1", "--json"});

    expectValid(diff.output);
    EXPECT_THAT(diff.output,
                AllOf(HasSubstr(R"({"format": "projectctl-diff", "version": 1, "changes": [)"),
                      HasSubstr(R"("change": "added", "name": "src/main.cpp", "category": "Status")")));
}

class SetupDiff : public HistoryTest {};

TEST_F(SetupDiff, letsGitShowTheTextInWords) {
    ASSERT_THAT(tool({"label", "put", "Status", "Done", "src/pump.cpp"}), SucceedsSilently());
    EXPECT_THAT(git_.run({"diff", "HEAD"}), HasSubstr("{\"file\":"));

    ASSERT_THAT(tool({"setup", "--diff"}), SucceedsSilently());
    ASSERT_THAT(tool({"setup", "--diff"}), SucceedsSilently());

    EXPECT_THAT(git_.run({"diff", "HEAD"}),
                AllOf(HasSubstr("\n+put Status=Done src/pump.cpp\n"), Not(HasSubstr("{\"file\":"))));
    EXPECT_THAT(git_.run({"log", "-p", "-1"}), HasSubstr("\n+put Status=Open src/main.cpp\n"));
}

TEST_F(SetupDiff, isUndone) {
    folder_.addFile(".git/info/attributes", "*.o binary");
    ASSERT_THAT(tool({"setup", "--diff"}), SucceedsSilently());

    ASSERT_THAT(tool({"setup", "--no-diff"}), SucceedsSilently());

    EXPECT_THAT(git_.run({"log", "-p", "-1"}), HasSubstr("{\"file\":"));
    std::ifstream file(inFolder(".git/info/attributes"));
    EXPECT_EQ(std::string(std::istreambuf_iterator<char>(file), {}), "*.o binary\n");
}

TEST_F(SetupDiff, letsGitShowLinesWhereTheTextIsUnreadable) {
    ASSERT_THAT(tool({"setup", "--diff"}), SucceedsSilently());
    writeText("not a text\n");

    EXPECT_THAT(git_.run({"diff", "HEAD"}), HasSubstr("\n+not a text\n"));
}

} // namespace
} // namespace project::test
