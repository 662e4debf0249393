#include "git/RepositoriesFixture.hpp"
#include "project/git/GitError.hpp"
#include "support/EnvironmentVariable.hpp"

namespace project::git {
namespace {

class WorkingFolder {
public:
    explicit WorkingFolder(std::filesystem::path const& folder) { std::filesystem::current_path(folder); }

    ~WorkingFolder() { std::filesystem::current_path(before_); }

    WorkingFolder(WorkingFolder const&) = delete;
    WorkingFolder& operator=(WorkingFolder const&) = delete;

private:
    std::filesystem::path before_ = std::filesystem::current_path();
};

/// GIT_DIR, GIT_WORK_TREE and GIT_INDEX_FILE.
class Environment : public RepositoriesTest {};

TEST_F(Environment, aRepositoryWithAWorkTreeInItsConfigurationKeepsIt) {
    auto const meta = committed("meta");
    auto const work = folder.addFolder("work");
    meta.run({"config", "core.worktree", work.string()});
    std::filesystem::rename(meta.onDisk() / "kept", work / "kept");
    test::EnvironmentVariable const gitDir("GIT_DIR", meta.onDisk() / ".git");
    GitRepository const repository(work, {{"GIT_DIR", meta.onDisk() / ".git"}});
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    expectAgreement(repository, adapter);
}

TEST_F(Environment, namesRepositoryWorkTreeAndIndex) {
    auto const meta = committed("meta");
    auto const work = folder.addFolder("work");
    test::EnvironmentVariable const gitDir("GIT_DIR", meta.onDisk() / ".git");
    test::EnvironmentVariable const workTree("GIT_WORK_TREE", work);
    test::EnvironmentVariable const index("GIT_INDEX_FILE", folder.onDisk() / "index");
    GitRepository const repository(work, {{"GIT_DIR", meta.onDisk() / ".git"},
                                          {"GIT_WORK_TREE", work},
                                          {"GIT_INDEX_FILE", folder.onDisk() / "index"}});
    repository.write("kept");
    repository.run({"add", "-A"});
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    auto const before = meta.index();
    expectAgreement(repository, adapter);
    EXPECT_EQ(meta.index(), before);
}

TEST_F(Environment, withARepositoryAloneTheWorkingFolderIsTheWorkTree) {
    auto const meta = committed("meta");
    GitRepository const repository(folder.addFolder("work"), {{"GIT_DIR", meta.onDisk() / ".git"}});
    repository.write("kept");
    test::EnvironmentVariable const gitDir("GIT_DIR", meta.onDisk() / ".git");
    WorkingFolder const here(repository.onDisk());
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    expectAgreement(repository, adapter);
}

TEST_F(Environment, withSomethingElseInPlaceOfARepositoryIsAnError) {
    auto const repository = committed("work");
    test::EnvironmentVariable const gitDir("GIT_DIR", folder.onDisk() / "work/d");
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    EXPECT_THROW(repository.adapterStates(adapter, {"kept"}), GitError);
}

TEST_F(Environment, countsOnlyWhereItIsAskedFor) {
    auto const meta = committed("meta");
    auto const repository = committed("work");
    test::EnvironmentVariable const gitDir("GIT_DIR", meta.onDisk() / ".git");
    test::EnvironmentVariable const workTree("GIT_WORK_TREE", meta.onDisk());
    GitAdapter ignoring(repository.root());
    EXPECT_EQ(repository.adapterStates(ignoring, {"kept"}).at("kept"), 1);
    GitAdapter honouring(repository.root(), GitEnvironment::Honoured);
    EXPECT_EQ(repository.adapterStates(honouring, {"kept"}).at("kept"), 8);
    EXPECT_EQ(meta.adapterStates(honouring, {"kept"}).at("kept"), 1);
}

TEST_F(Environment, withoutItsVariablesTheRepositoryAroundTheProjectCounts) {
    auto const repository = committed("work");
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    expectAgreement(repository, adapter);
}

TEST_F(Environment, mayNameTheIndexAlone) {
    auto const repository = committed("work");
    auto const before = repository.index();
    test::EnvironmentVariable const index("GIT_INDEX_FILE", folder.onDisk() / "index");
    GitRepository const other(repository.onDisk(), {{"GIT_INDEX_FILE", folder.onDisk() / "index"}});
    other.run({"read-tree", "HEAD"});
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    expectAgreement(other, adapter);
    EXPECT_EQ(repository.index(), before);
}

TEST_F(Environment, mayNameTheWorkTreeAlone) {
    auto const repository = committed("work");
    auto const elsewhere = folder.addFolder("elsewhere");
    std::filesystem::rename(repository.onDisk() / "kept", elsewhere / "kept");
    std::filesystem::create_directory(elsewhere / "d");
    test::EnvironmentVariable const workTree("GIT_WORK_TREE", elsewhere);
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    GitRepository const files(elsewhere);
    EXPECT_EQ(files.adapterStates(adapter, {"kept", "d/kept"}), (States{{"kept", 1}, {"d/kept", 3}}));
    EXPECT_EQ(repository.adapterStates(adapter, {"kept"}).at("kept"), 8);
}

TEST_F(Environment, withABareRepositoryAloneThereIsNoWorkTree) {
    runGit(folder.onDisk(), {"init", "-q", "--bare", "bare.git"});
    GitRepository const files(folder.addFolder("work"));
    test::EnvironmentVariable const gitDir("GIT_DIR", folder.onDisk() / "bare.git");
    WorkingFolder const here(files.onDisk());
    GitAdapter adapter(files.root(), GitEnvironment::Honoured);
    expectNoRepository(files, adapter);
}

TEST_F(Environment, namesNothingWhereThereIsNoRepository) {
    GitRepository const files(folder.addFolder("work"));
    test::EnvironmentVariable const workTree("GIT_WORK_TREE", files.onDisk());
    test::EnvironmentVariable const index("GIT_INDEX_FILE", folder.onDisk() / "index");
    GitAdapter adapter(files.root(), GitEnvironment::Honoured);
    expectNoRepository(files, adapter);
}

} // namespace
} // namespace project::git
