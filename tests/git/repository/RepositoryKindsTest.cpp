#include <cstdlib>

#include <sys/syscall.h>
#include <unistd.h>

#include "git/RepositoriesFixture.hpp"
#include "project/git/GitError.hpp"
#include "support/ChildProcess.hpp"

namespace project::git {
namespace {

bool isOtherUser = false;

/// Lets this process appear as another user, to whom no file here belongs, until the object goes.
class OtherUser {
public:
    OtherUser() { isOtherUser = true; }

    ~OtherUser() { isOtherUser = false; }

    OtherUser(OtherUser const&) = delete;
    OtherUser& operator=(OtherUser const&) = delete;
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

TEST_F(RepositoryKinds, aFileInPlaceOfASubmoduleIs7AndARepositoryWithoutACommit1) {
    committed("library");
    auto const outer = committed("work");
    outer.run({"submodule", "--quiet", "add", (folder.onDisk() / "library").string(), "sub"});
    outer.commitAll();
    GitAdapter adapter(outer.root());
    outer.remove("sub");
    outer.write("sub");
    expectStates(outer, adapter);
    EXPECT_EQ(outer.adapterStates(adapter, {"sub"}).at("sub"), 7);
    outer.remove("sub");
    GitRepository::init(folder.addFolder("work/sub"));
    expectStates(outer, adapter);
    EXPECT_EQ(outer.adapterStates(adapter, {"sub"}).at("sub"), 1);
}

TEST_F(RepositoryKinds, aWorkTreeWhoseRepositoryIsElsewhere) {
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

TEST_F(RepositoryKinds, aRepositoryThatIsCreatedLaterIsFoundAndADeletedOneIsDropped) {
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
    auto const repository = committed("work");
    OtherUser const user;
    GitAdapter adapter(repository.root());
    try {
        repository.adapterStates(adapter, {"kept"});
        FAIL() << "the repository was not refused";
    } catch (GitError const& error) {
        EXPECT_THAT(error.what(), testing::HasSubstr("git config --global --add safe.directory"));
    }
}

TEST_F(RepositoryKinds, aRepositoryOfAnUnknownFormatIsRefused) {
    auto const repository = committed("work");
    repository.run({"config", "core.repositoryFormatVersion", "99"});
    GitAdapter adapter(repository.root());
    EXPECT_THROW(repository.adapterStates(adapter, {"kept"}), GitError);
}

} // namespace
} // namespace project::git

/// The function of the system under the same name, which libgit2 calls to compare the user with a
/// repository's owner.
extern "C" __attribute__((visibility("default"))) uid_t geteuid() noexcept {
    auto const own = static_cast<uid_t>(::syscall(SYS_geteuid));
    return project::git::isOtherUser ? own + 1 : own;
}
