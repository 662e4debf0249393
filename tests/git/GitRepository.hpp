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

/// The output of a git command that runs in a folder, with the repository's configuration only.
/// @throws std::runtime_error if it fails.
std::string runGit(std::filesystem::path const& folder, std::vector<std::string> const& arguments,
                   std::map<std::string, std::string> const& environment = {});

/// The records of an output that ends each with a NUL.
std::vector<std::string> recordsOf(std::string const& text);

/// A work tree for the git command.
class GitRepository {
public:
    /// @param workTree a folder in an existing repository.
    explicit GitRepository(std::filesystem::path workTree,
                           std::map<std::string, std::string> environment = {})
        : workTree_(std::move(workTree)), environment_(std::move(environment)) {}

    /// Creates a plain repository in a folder.
    static GitRepository init(std::filesystem::path const& workTree);

    std::filesystem::path const& onDisk() const { return workTree_; }

    Path root() const { return fl::filesystem::fromSystem(workTree_); }

    Path path(std::string const& name) const { return fl::filesystem::fromSystem(workTree_ / name); }

    std::vector<Path> paths(std::vector<std::string> const& names) const;

    std::string run(std::vector<std::string> const& arguments) const;

    /// The same on another index.
    std::string runOnIndex(std::filesystem::path const& index,
                           std::vector<std::string> const& arguments) const;

    /// Stages everything and commits it.
    void commitAll() const;

    void write(std::string const& name, std::string const& content = "content\n") const;

    void remove(std::string const& name) const { std::filesystem::remove_all(workTree_ / name); }

    /// The entries of the index: modes, ids, stages, names, and flags in the form of `git ls-files -t`.
    std::string index() const { return run({"ls-files", "-z", "-s", "-t", "-v"}); }

    std::filesystem::path indexFile() const;

    /// The states of all files from `git status`, in the numbers of the adapter.
    States statusStates() const;

    /// The states of some files from the adapter.
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

    /// The state of a file from the adapter, which must agree with `git status`.
    int agreedStateOf(std::string const& name) {
        auto const expected = repository.statusStates();
        EXPECT_TRUE(expected.contains(name)) << name << " is not in git's output";
        EXPECT_EQ(stateOf(name), expected.at(name)) << name;
        return stateOf(name);
    }

    void commitFile(std::string const& name, std::string const& content = "content\n") const {
        repository.write(name, content);
        repository.commitAll();
    }
};

} // namespace project::git
