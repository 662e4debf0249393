#include "project/git/GitError.hpp"

namespace project::git {
namespace {

TEST(GitError, namesTheFileTheProblemAndTheRemedy) {
    GitError const error(GitError::Kind::Busy, "/p/.git/index.lock", "the index is locked", "Try again.");

    EXPECT_STREQ(error.what(), "/p/.git/index.lock: the index is locked. Try again.");
    EXPECT_EQ(error.kind(), GitError::Kind::Busy);
    EXPECT_EQ(error.file(), "/p/.git/index.lock");
    EXPECT_EQ(error.problem(), "the index is locked");
    EXPECT_EQ(error.remedy(), "Try again.");
}

TEST(GitError, leavesOutEmptyParts) {
    EXPECT_STREQ(GitError(GitError::Kind::Failed, "", "the disk is full", "").what(), "the disk is full.");
}

TEST(GitError, recordsTheStackAndACopyKeepsIt) {
    GitError const error(GitError::Kind::Failed, "/p", "no permission", "");
    GitError copy(error);

    EXPECT_FALSE(error.getStackTrace().getFrames().empty());
    EXPECT_EQ(copy.getStackTrace().getFrames(), error.getStackTrace().getFrames());
    EXPECT_STREQ(copy.what(), error.what());
}

TEST(GitError, isCaughtAsAStandardException) {
    EXPECT_THROW(throw GitError(GitError::Kind::Refused, "", "x", ""), std::exception);
}

} // namespace
} // namespace project::git
