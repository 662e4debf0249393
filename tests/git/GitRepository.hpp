#pragma once

#include <filesystem>
#include <map>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/git/GitAdapter.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::git {

using Path = fl::filesystem::Path;
using States = std::map<std::string, int>;

/// What the git command writes, run in a folder with no configuration but the repository's.
/// @throws std::runtime_error when it fails.
std::string runGit(std::filesystem::path const& folder, std::vector<std::string> const& arguments,
                   std::map<std::string, std::string> const& environment = {});

/// The records of an answer that ends each with a NUL.
std::vector<std::string> recordsOf(std::string const& text);

/// A work tree that the git command works on.
class GitRepository {
public:
    /// @param workTree a folder that lies in a repository already.
    explicit GitRepository(std::filesystem::path workTree,
                           std::map<std::string, std::string> environment = {})
        : workTree_(std::move(workTree)), environment_(std::move(environment)) {}

    /// Makes a plain repository in a folder.
    static GitRepository init(std::filesystem::path const& workTree);

    std::filesystem::path const& onDisk() const { return workTree_; }

    Path root() const { return fl::filesystem::fromSystem(workTree_); }

    Path path(std::string const& name) const { return fl::filesystem::fromSystem(workTree_ / name); }

    std::vector<Path> paths(std::vector<std::string> const& names) const;

    std::string run(std::vector<std::string> const& arguments) const;

    /// The same, with another index for this one time.
    std::string runOnIndex(std::filesystem::path const& index,
                           std::vector<std::string> const& arguments) const;

    /// Stages everything and commits it.
    void commitAll() const;

    void write(std::string const& name, std::string const& content = "content\n") const;

    void remove(std::string const& name) const { std::filesystem::remove_all(workTree_ / name); }

    /// What the index has: modes, ids, stages, names, and flags in the form of `git ls-files -t`.
    std::string index() const { return run({"ls-files", "-z", "-s", "-t", "-v"}); }

    std::filesystem::path indexFile() const;

    /// What `git status` says of each file, in the numbers of the adapter.
    States statusStates() const;

    /// What the adapter says of these.
    States adapterStates(GitAdapter& adapter, std::vector<std::string> const& names) const;

private:
    std::filesystem::path workTree_;
    std::map<std::string, std::string> environment_;
};

/// A repository in a temporary folder, with an adapter for it.
class GitTest : public ::testing::Test {
protected:
    test::TemporaryFolder folder;
    GitRepository repository = GitRepository::init(folder.addFolder("work"));
    GitAdapter adapter{repository.root()};

    int stateOf(std::string const& name) { return repository.adapterStates(adapter, {name}).at(name); }

    /// The adapter's answer for a name, which has to be that of `git status`, too.
    int agreedStateOf(std::string const& name) {
        auto const expected = repository.statusStates();
        EXPECT_TRUE(expected.contains(name)) << name << " is not in git's answer";
        EXPECT_EQ(stateOf(name), expected.at(name)) << name;
        return stateOf(name);
    }

    void commitFile(std::string const& name, std::string const& content = "content\n") const {
        repository.write(name, content);
        repository.commitAll();
    }
};

} // namespace project::git
