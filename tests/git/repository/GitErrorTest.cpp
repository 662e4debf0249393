#include "project/git/GitError.hpp"

namespace project::git {
namespace {

TEST(GitError, namesTheFileTheProblemAndTheRemedy) {
    GitError const error("/p/.git/index.lock", "the index is locked", "Try again.");

    EXPECT_STREQ(error.what(), "/p/.git/index.lock: the index is locked. Try again.");
    EXPECT_EQ(error.getFile(), "/p/.git/index.lock");
    EXPECT_EQ(error.getProblem(), "the index is locked");
    EXPECT_EQ(error.getRemedy(), "Try again.");
}

TEST(GitError, leavesOutWhatIsNotThere) {
    EXPECT_STREQ(GitError("", "the disk is full", "").what(), "the disk is full.");
}

TEST(GitError, recordsWhereItWasMadeAndACopyKeepsThat) {
    GitError const error("/p", "no permission", "");
    GitError copy(error);

    EXPECT_FALSE(error.getStackTrace().getFrames().empty());
    EXPECT_EQ(copy.getStackTrace().getFrames(), error.getStackTrace().getFrames());
    EXPECT_STREQ(copy.what(), error.what());
}

TEST(GitError, isCaughtAsAStandardException) {
    EXPECT_THROW(throw GitError("", "x", ""), std::exception);
}

} // namespace
} // namespace project::git
