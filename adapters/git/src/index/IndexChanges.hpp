#pragma once

#include <functional>
#include <map>
#include <set>

#include "repository/LibGit.hpp"
#include "repository/WorkTreeRoot.hpp"

namespace project::git {

/// The changes of one call to the index.
struct IndexChanges {
    std::map<TreePath, git_index_entry, std::less<>> staged; ///< without the paths in the entries
    std::set<TreePath, std::less<>> removed;

    bool empty() const { return staged.empty() && removed.empty(); }

    /// Whether the entries for a path, including those of a conflict, are dropped.
    bool isDropped(char const* path) const { return removed.contains(path) || staged.contains(path); }
};

} // namespace project::git
