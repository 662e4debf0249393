#include <regex>

#include "tools/history/HistoryTest.hpp"

namespace project::test {
namespace {

using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;

class LogCommand : public HistoryTest {};

TEST_F(LogCommand, showsTheCommitsWithTheirChangesTheYoungestFirst) {
    auto const log = tool({"log"});

    EXPECT_EQ(log.exitCode, 0) << log.errors;
    EXPECT_THAT(withoutIds(log.output), StartsWith("Tester: a label\n"
                                                   "    put Status=Open src/main.cpp\n"
                                                   "Tester: sources\n"
                                                   "    add src\n"
                                                   "    add src/main.cpp\n"
                                                   "    add src/pump.cpp\n"
                                                   "Tester: the project\n"));
    EXPECT_TRUE(
        std::regex_search(log.output, std::regex("^[0-9a-f]{10} \\d{4}-\\d\\d-\\d\\d Tester: a label\n")));
}

TEST_F(LogCommand, showsARenamedFolderAsOneChange) {
    renameSources();
    commit("a rename");

    EXPECT_EQ(withoutIds(tool({"log", "--count", "1"}).output), "Tester: a rename\n    rename src lib\n");
}

TEST_F(LogCommand, followsAFileToItsEarlierNames) {
    renameSources();
    commit("a rename");
    ASSERT_THAT(tool({"label", "put", "Status", "Done", "a"}), SucceedsSilently());
    commit("another file");

    EXPECT_EQ(withoutIds(tool({"log", "lib/main.cpp"}).output), "Tester: a rename\n"
                                                                "    rename src/main.cpp lib/main.cpp\n"
                                                                "Tester: a label\n"
                                                                "    put Status=Open src/main.cpp\n"
                                                                "Tester: sources\n"
                                                                "    add src/main.cpp\n");
}

TEST_F(LogCommand, followsAFolderWithEverythingBelowIt) {
    renameSources();
    commit("a rename");

    EXPECT_THAT(withoutIds(tool({"log", "lib"}).output), HasSubstr("    put Status=Open src/main.cpp\n"));
    EXPECT_EQ(withoutIds(tool({"log", "--count", "1", "lib"}).output),
              "Tester: a rename\n    rename src lib\n");
    EXPECT_THAT(tool({"log", "a"}).output, Not(HasSubstr("src")));
}

TEST_F(LogCommand, ofAMergeShowsTheChangesThatNoParentHas) {
    git_.run({"switch", "-q", "-c", "hers"});
    ASSERT_THAT(tool({"name", "Hers"}), SucceedsSilently());
    commit("her name");
    git_.run({"switch", "-q", "main"});
    ASSERT_THAT(tool({"name", "His"}), SucceedsSilently());
    commit("his name");
    ASSERT_EQ(git_.tryTo({"merge", "-q", "-m", "both", "hers"}).exitCode, 1);
    ASSERT_THAT(tool({"resolve", "--ours"}), SucceedsSilently());
    ASSERT_THAT(tool({"description", "D"}), SucceedsSilently());
    commit("both");

    EXPECT_THAT(withoutIds(tool({"log"}).output), StartsWith("Tester: both\n    description D\n"));
}

TEST_F(LogCommand, startsFewProcessesForManyCommits) {
    for (int number = 0; number < 40; ++number) {
        ASSERT_THAT(tool({"name", "Name " + std::to_string(number)}), SucceedsSilently());
        commit("a name");
    }
    folder_.addFile("bin/git", "#!/bin/sh\necho x >>'" + inFolder("calls") + "'\nexec /usr/bin/git \"$@\"\n");
    std::filesystem::permissions(inFolder("bin/git"), std::filesystem::perms::owner_all);
    settings_.environment["PATH"] = inFolder("bin") + ":/usr/bin:/bin";

    ASSERT_EQ(tool({"log"}).exitCode, 0);

    std::ifstream calls(inFolder("calls"));
    auto const count = std::count(std::istreambuf_iterator<char>(calls), {}, 'x');
    EXPECT_GT(count, 1);
    EXPECT_LT(count, 8);
}

TEST_F(LogCommand, followsAProjectThatWasMovedInTheRepository) {
    folder_.addFolder("below");
    for (auto const* name : {".projectdata", "src", "a", "b", "c"}) {
        std::filesystem::rename(inFolder(name), inFolder("below/" + std::string(name)));
    }
    git_.run({"add", "-A"});
    git_.run({"commit", "-q", "-m", "a move"});
    ASSERT_THAT(toolFrom("below", {"name", "Moved"}), SucceedsSilently());
    commit("a name");

    auto const log = withoutIds(toolFrom("below", {"log"}).output);

    EXPECT_THAT(log, StartsWith("Tester: a name\n    name Moved\nTester: a move\nTester: a label\n"));
}

TEST_F(LogCommand, writesJson) {
    auto const log = tool({"log", "--json", "--count", "1"});

    expectValid(log.output);
    EXPECT_THAT(log.output, HasSubstr(R"("subject": "a label", "changes": [)"));
    EXPECT_THAT(log.output,
                HasSubstr(R"({"subject": "fileLabel", "change": "added", "name": "src/main.cpp", )"
                          R"("category": "Status", "label": "Open", "values": []})"));
}

class LogOutsideARepository : public ToolTest {};

TEST_F(LogOutsideARepository, isAnError) {
    initProject();

    EXPECT_THAT(tool({"log"}), FailsWith(1, "is not in a git repository"));
    EXPECT_THAT(tool({"diff"}), FailsWith(1, "is not in a git repository"));
}

} // namespace
} // namespace project::test
