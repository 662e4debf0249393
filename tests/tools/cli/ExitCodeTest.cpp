#include "cli/ExitCode.hpp"

#include <map>
#include <set>

#include "output/Failure.hpp"
#include "project/git/GitError.hpp"
#include "project/stores/StoreError.hpp"
#include "support/GitFolder.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using projectctl::exitCodeFor;
using stores::StoreError;
using ::testing::AllOf;
using ::testing::HasSubstr;

TEST(ExitCode, differsForEachKindOfStoreError) {
    using Kind = StoreError::Kind;
    std::map<Kind, int> const expected{
        {Kind::Refused, 1},    {Kind::Busy, 4},        {Kind::Damaged, 5},       {Kind::Conflict, 6},
        {Kind::DiskFailed, 7}, {Kind::Unreachable, 7}, {Kind::OutcomeUnknown, 8}};
    for (auto const& [kind, code] : expected) {
        EXPECT_EQ(exitCodeFor(StoreError(kind, "file", 1, "problem", "Remedy.")), code);
    }
}

TEST(ExitCode, isThatOfBusyForALockedIndex) {
    using git::GitError;
    EXPECT_EQ(exitCodeFor(GitError(GitError::Kind::Busy, "index.lock", "is locked", "Try again.")), 4);
    EXPECT_EQ(exitCodeFor(GitError(GitError::Kind::Failed, "index", "cannot be written", "Look.")), 1);
}

TEST(ExitCode, isOneForAnyOtherError) {
    EXPECT_EQ(exitCodeFor(projectctl::Failure(projectctl::Message("EmptyPath"))), 1);
    EXPECT_EQ(exitCodeFor(std::bad_alloc()), 1);
}

class ExitCodes : public ToolTest {};

TEST_F(ExitCodes, areInTheHelp) {
    EXPECT_THAT(tool({"--help"}).output,
                AllOf(HasSubstr("Exit codes:\n  0  done\n  1  "),
                      HasSubstr("\n  3  done, and a fault was found"), HasSubstr("\n  8  the outcome")));
}

TEST(ExitCode, hasAWordOfItsOwn) {
    std::set<std::string_view> words;
    for (int code = projectctl::exit_code::done; code <= projectctl::exit_code::outcomeUnknown; ++code) {
        words.insert(projectctl::nameOf(code));
    }
    EXPECT_EQ(words.size(), 9U);
}

TEST_F(ExitCodes, areInTheErrorsInJson) {
    auto const expectError = [this](int code, std::string const& word, std::vector<std::string> command) {
        command.emplace_back("--json");
        EXPECT_THAT(tool(command), FailsInJsonWith(code, "\"code\": \"" + word + '"'));
    };
    GitFolder const git(folder_.onDisk());
    folder_.addFile("a");
    expectError(1, "failed", {"list"}); // no project
    expectError(2, "wrong-use", {"list", "--unknown"});
    initProject();
    folder_.addFile(".git/index.lock");
    expectError(4, "busy", {"add", "a"});
    std::filesystem::remove(inFolder(".git/index.lock"));
    auto const good = readText();
    insertLineBefore(R"({"at":["Info")", "hello");
    expectError(5, "damaged", {"add", "a"});
    writeText(good);
    insertLineBefore(R"({"at":["Info")", "<<<<<<< ours\n\"b\"\n=======\n\"c\"\n>>>>>>> theirs");
    expectError(6, "conflict", {"add", "a"});
}

TEST_F(ExitCodes, distinguishAFindingAFailureAndAWrongUse) {
    EXPECT_EQ(tool({"check"}).exitCode, 1); // no project
    initProject();
    EXPECT_EQ(tool({"check"}).exitCode, 0);
    EXPECT_EQ(tool({"check", "--unknown"}).exitCode, 2);
    insertLineBefore(R"({"at":["Info")", "\"lost/file\"");
    EXPECT_EQ(tool({"check"}).exitCode, 3);
}

} // namespace
} // namespace project::test
