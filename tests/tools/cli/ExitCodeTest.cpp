#include "cli/ExitCode.hpp"

#include <map>
#include <set>

#include "output/Failure.hpp"
#include "project/git/GitError.hpp"
#include "project/stores/StoreError.hpp"
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
