#pragma once

#include <memory>
#include <optional>

#include "project/git/GitEnvironment.hpp"
#include "repository/LibGit.hpp"
#include "repository/Repository.hpp"

namespace project::git {

/// Finds the repository of a project's folder and keeps it open.
class RepositoryFinder {
public:
    RepositoryFinder(fl::filesystem::Path root, GitEnvironment environment);

    /// The repository in its current state; null if there is none or it has no work tree.
    /// @throws GitError if there is one that cannot be read.
    Repository* find();

    /// The repository that find returned, in the state of that time.
    Repository* found() const noexcept { return repository_.get(); }

private:
    RepositoryHandle open();
    std::string indexOfEnvironment() const;

    std::optional<LibGit> library_; ///< outlives the repository; initialised on first use
    fl::filesystem::Path root_;
    GitEnvironment environment_;
    std::unique_ptr<Repository> repository_;
};

} // namespace project::git
