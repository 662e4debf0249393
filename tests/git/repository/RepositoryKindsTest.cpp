#include <cstdlib>

#include <unistd.h>

#include "git/RepositoriesFixture.hpp"
#include "project/git/GitError.hpp"
#include "support/ChildProcess.hpp"

namespace project::git {
namespace {

/// Sets a variable of this process until the object goes.
class Variable {
public:
    Variable(char const* name, std::string const& value) : name_(name) { ::setenv(name, value.c_str(), 1); }

    ~Variable() { ::unsetenv(name_); }

    Variable(Variable const&) = delete;
    Variable& operator=(Variable const&) = delete;

private:
    char const* name_;
};

class WorkingFolder {
public:
    explicit WorkingFolder(std::filesystem::path const& folder) { std::filesystem::current_path(folder); }

    ~WorkingFolder() { std::filesystem::current_path(before_); }

    WorkingFolder(WorkingFolder const&) = delete;
    WorkingFolder& operator=(WorkingFolder const&) = delete;

private:
    std::filesystem::path before_ = std::filesystem::current_path();
};

class RepositoryKinds : public RepositoriesTest {};

TEST_F(RepositoryKinds, aPlainRepository) {
    auto const repository = committed("work");
    GitAdapter adapter(repository.root());
    expectAgreement(repository, adapter);
}

TEST_F(RepositoryKinds, aProjectInAFolderOfTheWorkTree) {
    auto const repository = committed("work");
    GitAdapter adapter(repository.path("d"));
    expectAgreement(repository, adapter, "d/kept");
}

TEST_F(RepositoryKinds, aRepositoryWithoutACommit) {
    auto const repository = GitRepository::init(folder.addFolder("work"));
    repository.write("a");
    GitAdapter adapter(repository.root());
    expectStates(repository, adapter);
    adapter.addToSourceControl({repository.path("a")});
    expectStates(repository, adapter);
    EXPECT_EQ(repository.statusStates().at("a"), 5);
    adapter.removeFromSourceControl({repository.path("a")});
    expectStates(repository, adapter);
    EXPECT_EQ(repository.statusStates().at("a"), 0);
}

TEST_F(RepositoryKinds, aLinkedWorktree) {
    auto const main = committed("work");
    main.run({"worktree", "add", "-q", (folder.onDisk() / "linked").string()});
    auto const before = main.index();
    GitRepository const linked(folder.onDisk() / "linked");
    GitAdapter adapter(linked.root());
    expectAgreement(linked, adapter);
    EXPECT_EQ(main.index(), before);
}

TEST_F(RepositoryKinds, aLinkedWorktreeOfABareRepository) {
    committed("work");
    runGit(folder.onDisk(), {"clone", "-q", "--bare", "work", "bare.git"});
    runGit(folder.onDisk() / "bare.git", {"worktree", "add", "-q", (folder.onDisk() / "linked").string()});
    GitRepository const linked(folder.onDisk() / "linked");
    GitAdapter adapter(linked.root());
    expectAgreement(linked, adapter);
}

TEST_F(RepositoryKinds, aSubmodule) {
    committed("library");
    auto const outer = committed("work");
    outer.run({"submodule", "--quiet", "add", (folder.onDisk() / "library").string(), "sub"});
    outer.commitAll();
    GitRepository const sub(outer.onDisk() / "sub");
    GitAdapter inSub(sub.root());
    expectAgreement(sub, inSub);
}

TEST_F(RepositoryKinds, aSubmoduleSeenFromOutside) {
    committed("library");
    auto const outer = committed("work");
    outer.run({"submodule", "--quiet", "add", (folder.onDisk() / "library").string(), "sub"});
    GitAdapter adapter(outer.root());
    expectStates(outer, adapter);
    outer.commitAll();
    expectStates(outer, adapter);
    EXPECT_EQ(outer.adapterStates(adapter, {"sub", "sub/kept", "sub/d"}),
              (States{{"sub", 1}, {"sub/kept", 8}, {"sub/d", 8}}));

    GitRepository const sub(outer.onDisk() / "sub");
    sub.write("kept", "other\n");
    EXPECT_EQ(outer.adapterStates(adapter, {"sub"}).at("sub"), 1);
    sub.commitAll();
    expectStates(outer, adapter);
    EXPECT_EQ(outer.adapterStates(adapter, {"sub"}).at("sub"), 3);

    auto const before = outer.index();
    adapter.addToSourceControl(outer.paths({"sub", "sub/kept"}));
    EXPECT_EQ(outer.index(), before);
    outer.run({"submodule", "--quiet", "deinit", "-f", "sub"});
    expectStates(outer, adapter);
    outer.write("sub/stray");
    EXPECT_EQ(outer.adapterStates(adapter, {"sub/stray"}).at("sub/stray"), 8);
    adapter.removeFromSourceControl(outer.paths({"sub"}));
    expectStates(outer, adapter);
}

TEST_F(RepositoryKinds, aWorkTreeWhoseRepositoryLiesElsewhere) {
    auto const work = folder.addFolder("work");
    runGit(folder.onDisk(),
           {"init", "-q", "--separate-git-dir", (folder.onDisk() / "meta").string(), "work"});
    GitRepository const repository(work);
    repository.write("kept");
    repository.commitAll();
    GitAdapter adapter(repository.root());
    expectAgreement(repository, adapter);
    EXPECT_FALSE(std::filesystem::is_directory(work / ".git"));
}

TEST_F(RepositoryKinds, aWorkTreeThatTheRepositoryNames) {
    auto const meta = committed("meta");
    auto const work = folder.addFolder("work");
    meta.run({"config", "core.worktree", work.string()});
    std::filesystem::rename(meta.onDisk() / "kept", work / "kept");
    Variable const gitDir("GIT_DIR", meta.onDisk() / ".git");
    GitRepository const repository(work, {{"GIT_DIR", meta.onDisk() / ".git"}});
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    expectAgreement(repository, adapter);
}

TEST_F(RepositoryKinds, theEnvironmentNamesRepositoryWorkTreeAndIndex) {
    auto const meta = committed("meta");
    auto const work = folder.addFolder("work");
    Variable const gitDir("GIT_DIR", meta.onDisk() / ".git");
    Variable const workTree("GIT_WORK_TREE", work);
    Variable const index("GIT_INDEX_FILE", folder.onDisk() / "index");
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

TEST_F(RepositoryKinds, withARepositoryInTheEnvironmentAloneTheWorkingFolderIsTheWorkTree) {
    auto const meta = committed("meta");
    GitRepository const repository(folder.addFolder("work"), {{"GIT_DIR", meta.onDisk() / ".git"}});
    repository.write("kept");
    Variable const gitDir("GIT_DIR", meta.onDisk() / ".git");
    WorkingFolder const here(repository.onDisk());
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    expectAgreement(repository, adapter);
}

TEST_F(RepositoryKinds, aRepositoryInTheEnvironmentThatIsNoneIsAnError) {
    auto const repository = committed("work");
    Variable const gitDir("GIT_DIR", folder.onDisk() / "work/d");
    GitAdapter adapter(repository.root(), GitEnvironment::Honoured);
    EXPECT_THROW(repository.adapterStates(adapter, {"kept"}), GitError);
}

TEST_F(RepositoryKinds, theEnvironmentCountsOnlyForWhoeverAsksForIt) {
    auto const meta = committed("meta");
    auto const repository = committed("work");
    Variable const gitDir("GIT_DIR", meta.onDisk() / ".git");
    Variable const workTree("GIT_WORK_TREE", meta.onDisk());
    GitAdapter ignoring(repository.root());
    EXPECT_EQ(repository.adapterStates(ignoring, {"kept"}).at("kept"), 1);
    GitAdapter honouring(repository.root(), GitEnvironment::Honoured);
    EXPECT_EQ(repository.adapterStates(honouring, {"kept"}).at("kept"), 8);
    EXPECT_EQ(meta.adapterStates(honouring, {"kept"}).at("kept"), 1);
}

TEST_F(RepositoryKinds, inABareRepositoryNothingIsDone) {
    runGit(folder.onDisk(), {"init", "-q", "--bare", "bare.git"});
    GitRepository const bare(folder.onDisk() / "bare.git");
    GitAdapter adapter(bare.root());
    expectNoRepository(bare, adapter);
    EXPECT_FALSE(std::filesystem::exists(bare.onDisk() / "index"));
}

TEST_F(RepositoryKinds, outsideAnyRepositoryNothingIsDone) {
    GitRepository const none(folder.addFolder("none"));
    GitAdapter adapter(none.root());
    expectNoRepository(none, adapter);
    GitAdapter nowhere(folder.path(u"not/there"));
    expectNoRepository(none, nowhere);
}

TEST_F(RepositoryKinds, aRepositoryThatIsMadeLaterIsFoundAndOneThatWentIsLeft) {
    GitRepository const files(folder.addFolder("work"));
    GitAdapter adapter(files.root());
    expectNoRepository(files, adapter);
    GitRepository::init(files.onDisk());
    EXPECT_EQ(files.adapterStates(adapter, {"a"}).at("a"), 0);
    files.commitAll();
    EXPECT_EQ(files.adapterStates(adapter, {"a"}).at("a"), 1);
    files.remove(".git");
    expectNoRepository(files, adapter);
    GitRepository::init(files.onDisk());
    EXPECT_EQ(files.adapterStates(adapter, {"a"}).at("a"), 0);
}

TEST_F(RepositoryKinds, aRepositoryOfSomebodyElseIsRefusedWithWhatToDo) {
    if (::geteuid() != 0) {
        GTEST_SKIP() << "only root can give files away";
    }
    auto const repository = committed("work");
    std::filesystem::permissions(folder.onDisk(), std::filesystem::perms::all);
    auto const text = test::inUnprivilegedProcess([&] {
        GitAdapter adapter(repository.root());
        return std::to_string(repository.adapterStates(adapter, {"kept"}).at("kept"));
    });
    EXPECT_NE(text.find("git config --global --add safe.directory"), std::string::npos) << text;
}

TEST_F(RepositoryKinds, aRepositoryOfAnUnknownFormatIsRefused) {
    auto const repository = committed("work");
    repository.run({"config", "core.repositoryFormatVersion", "99"});
    GitAdapter adapter(repository.root());
    EXPECT_THROW(repository.adapterStates(adapter, {"kept"}), GitError);
}

} // namespace
} // namespace project::git
