#include <git2.h>

#include "git/RepositoriesFixture.hpp"
#include "project/git/GitError.hpp"
#include "support/ChildProcess.hpp"

namespace project::git {
namespace {

/// Sets the folder in which libgit2 looks for one of the user's files, for the lifetime of the object.
class SearchPath {
public:
    SearchPath(git_config_level_t level, std::filesystem::path const& folder) : level_(level) {
        git_libgit2_opts(GIT_OPT_SET_SEARCH_PATH, level_, folder.c_str());
    }

    ~SearchPath() { git_libgit2_opts(GIT_OPT_SET_SEARCH_PATH, level_, "/nowhere"); }

    SearchPath(SearchPath const&) = delete;
    SearchPath& operator=(SearchPath const&) = delete;

private:
    git_config_level_t level_;
};

/// The files in the user's own folders.
class UserConfiguration : public RepositoriesTest {
protected:
    /// A repository for which git reads the folder "config" as the user's.
    GitRepository repositoryOfUser() const {
        auto const work = committed("work").onDisk();
        return GitRepository(work, {{"XDG_CONFIG_HOME", folder.onDisk() / "config"}});
    }

    std::filesystem::path usersFolder() const { return folder.onDisk() / "config/git"; }

    /// The state of a committed file, or the text of the error, where the file of the user cannot be read.
    std::string stateWithUnreadable(std::filesystem::path const& file, git_config_level_t level) const {
        auto const repository = committed("work");
        folder.addFile(file, "[core]\n\tfileMode = true\n");
        std::filesystem::permissions(folder.onDisk(), std::filesystem::perms::all);
        std::filesystem::permissions(folder.onDisk() / file, std::filesystem::perms::none);
        return test::inUnprivilegedProcess([&] {
            git_libgit2_opts(GIT_OPT_SET_OWNER_VALIDATION,
                             0); // the repository may belong to another user here
            git_libgit2_opts(GIT_OPT_SET_SEARCH_PATH, level, (folder.onDisk() / file).parent_path().c_str());
            GitAdapter adapter(repository.root());
            return std::to_string(repository.adapterStates(adapter, {"kept"}).at("kept"));
        });
    }
};

TEST_F(UserConfiguration, ignoresFilesByTheUsersOwnRules) {
    auto const repository = repositoryOfUser();
    folder.addFile("config/git/ignore", "*.o\nd/\n");
    SearchPath const user(GIT_CONFIG_LEVEL_XDG, usersFolder());
    repository.write("a.o");
    repository.write("a");
    GitAdapter adapter(repository.root());
    expectStates(repository, adapter);
    EXPECT_EQ(repository.adapterStates(adapter, {"a.o"}).at("a.o"), 2);
}

TEST_F(UserConfiguration, givesFilesTheUsersOwnAttributes) {
    auto const repository = repositoryOfUser();
    repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
    folder.addFile("config/git/attributes", "*.up filter=upper\n");
    repository.write("a.up");
    repository.write("a");
    GitAdapter adapter(repository.root());
    {
        SearchPath const user(GIT_CONFIG_LEVEL_XDG, usersFolder());
        EXPECT_EQ(repository.run({"check-attr", "filter", "a.up"}), "a.up: filter: upper\n");
        EXPECT_THROW(adapter.addToSourceControl(repository.paths({"a.up"})), GitError);
        adapter.addToSourceControl(repository.paths({"a"}));
    }
    adapter.addToSourceControl(repository.paths({"a.up"}));
    EXPECT_EQ(repository.adapterStates(adapter, {"a", "a.up"}), (States{{"a", 5}, {"a.up", 5}}));
}

TEST_F(UserConfiguration, mayDefineMacrosForTheRepositorysAttributes) {
    auto const repository = repositoryOfUser();
    repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
    folder.addFile("config/git/attributes", "[attr]up filter=upper\n");
    repository.write(".gitattributes", "*.up up\n");
    repository.write("a.up");
    SearchPath const user(GIT_CONFIG_LEVEL_XDG, usersFolder());
    GitAdapter adapter(repository.root());
    EXPECT_EQ(repository.run({"check-attr", "filter", "a.up"}), "a.up: filter: upper\n");
    EXPECT_THROW(adapter.addToSourceControl(repository.paths({"a.up"})), GitError);
}

TEST_F(UserConfiguration, thatCannotBeReadIsPassedOverAsGitDoes) {
    EXPECT_EQ(stateWithUnreadable("home/.gitconfig", GIT_CONFIG_LEVEL_GLOBAL), "1");
}

TEST_F(UserConfiguration, thatCannotBeReadInTheFolderForConfigurationsIsPassedOverToo) {
    EXPECT_EQ(stateWithUnreadable("config/git/config", GIT_CONFIG_LEVEL_XDG), "1");
}

} // namespace
} // namespace project::git
