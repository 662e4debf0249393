#include "git/GitRepository.hpp"
#include "project/git/GitError.hpp"

namespace project::git {
namespace {

class IndexReading : public GitTest {};

TEST_F(IndexReading, anEmptyListNeedsNoRepository) {
    repository.write(".git/index", "damaged");
    EXPECT_TRUE(adapter.getFileStates({}).empty());
    adapter.addToSourceControl({});
    adapter.removeFromSourceControl({});
    repository.write("a");
    EXPECT_THROW(stateOf("a"), GitError); // shows that the index is damaged
}

TEST_F(IndexReading, aPathThatIsGivenTwiceIsReturnedOnce) {
    repository.write("a");
    EXPECT_EQ(adapter.getFileStates({repository.path("a"), repository.path("a")}).size(), 1u);
}

TEST_F(IndexReading, anIndexOfEveryVersionIsRead) {
    for (auto const* const version : {"2", "3", "4"}) {
        commitFile("dir/file" + std::string(version));
        repository.run({"update-index", "--index-version", version});
        EXPECT_EQ(agreedStateOf("dir/file" + std::string(version)), 1);
        EXPECT_EQ(agreedStateOf("dir/file2"), 1);
    }
}

TEST_F(IndexReading, anIndexWithExtensionsIsRead) {
    commitFile("a");
    repository.run({"update-index", "--force-untracked-cache"});
    repository.run({"status"});
    EXPECT_EQ(agreedStateOf("a"), 1);
}

TEST_F(IndexReading, aDamagedIndexIsAnErrorEachTimeUntilItIsRepaired) {
    commitFile("a");
    EXPECT_EQ(stateOf("a"), 1);
    auto const whole = folder.onDisk() / "whole";
    std::filesystem::copy_file(repository.indexFile(), whole);
    repository.write(".git/index", "damaged");
    EXPECT_THROW(stateOf("a"), GitError);
    EXPECT_THROW(stateOf("a"), GitError);
    EXPECT_THROW(adapter.removeFromSourceControl({repository.path("a")}), GitError);
    std::filesystem::rename(whole, repository.indexFile());
    EXPECT_EQ(agreedStateOf("a"), 1);
}

TEST_F(IndexReading, withoutAnIndexEverythingCommittedIsRemoved) {
    commitFile("a");
    EXPECT_EQ(stateOf("a"), 1);
    std::filesystem::remove(repository.indexFile());
    EXPECT_EQ(agreedStateOf("a"), 6);
}

TEST_F(IndexReading, aSplitIndexIsAnErrorWithARemedy) {
    commitFile("a");
    repository.run({"update-index", "--split-index"});
    try {
        stateOf("a");
        FAIL() << "it was read";
    } catch (GitError const& error) {
        EXPECT_NE(error.remedy().find("--no-split-index"), std::string::npos);
    }
    repository.run({"update-index", "--no-split-index"});
    EXPECT_EQ(agreedStateOf("a"), 1);
}

} // namespace
} // namespace project::git
