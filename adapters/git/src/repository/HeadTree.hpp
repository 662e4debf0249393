#pragma once

#include <string>
#include <unordered_map>

#include "repository/LibGit.hpp"
#include "repository/WorkTreeRoot.hpp"

namespace project::git {

/// The files of the last commit. Each folder is read on first use and kept until HEAD is another commit.
class HeadTree {
public:
    explicit HeadTree(git_repository* repository) : repository_(repository) {}

    /// Reads the last commit. It has no files if nothing was committed yet.
    /// @throws GitError if it cannot be read.
    void refresh();

    /// The file, link or submodule at a path; null if there is none. Valid until the next refresh.
    git_tree_entry const* find(TreePath const& path);

private:
    git_tree* folder(TreePath const& path);
    TreeHandle load(TreePath const& path);

    git_repository* repository_;
    git_oid root_{};
    std::unordered_map<TreePath, TreeHandle> folders_; // null if the commit has no such folder
};

} // namespace project::git
