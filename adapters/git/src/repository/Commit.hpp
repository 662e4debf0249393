#pragma once

#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "repository/LibGit.hpp"
#include "repository/WorkTreeRoot.hpp"

namespace project::git {

/// A commit and its files.
class Commit {
public:
    /// An entry of a commit: a file, a link or a folder.
    struct Entry {
        std::string id; ///< of its content, as bytes
        git_object_t type;

        friend bool operator==(Entry const&, Entry const&) = default;
    };

    /// The commit that is checked out; nothing before the first one.
    /// @throws GitError if it cannot be read.
    static std::optional<Commit> head(git_repository* repository);

    /// The entry at a path; nothing if there is none. The empty path is that of the whole tree.
    std::optional<Entry> find(TreePath const& path) const;

    /// The content of the file or link at a path; nothing if there is none.
    std::optional<std::string> contentAt(TreePath const& path) const;

    /// Those of which the repository has the files: a shallow clone does not have them all.
    std::vector<Commit> parents() const;

private:
    Commit(CommitHandle commit, TreeHandle tree) : commit_(std::move(commit)), tree_(std::move(tree)) {}

    static std::optional<Commit> withTree(CommitHandle commit);

    CommitHandle commit_;
    TreeHandle tree_;
};

/// The last commit that changed a path, as `git log -1` finds it: of a merge, only the parent is searched
/// that has the same entry. Nothing if there is none.
std::optional<Commit> lastChangeOf(TreePath const& path, std::optional<Commit> newest);

/// The contents that files had before the last commit that deleted them. A file that no commit has deleted is
/// missing in the result.
/// @param files that the newest commit does not contain.
std::map<TreePath, std::string> deletedContents(std::vector<TreePath> files, std::optional<Commit> newest);

} // namespace project::git
