#pragma once

#include <functional>
#include <map>
#include <set>

#include "repository/LibGit.hpp"
#include "repository/WorkTreeRoot.hpp"

namespace project::git {

/// What one call does to the index.
struct IndexChanges {
    std::map<TreePath, git_index_entry, std::less<>> staged; ///< the entries' own paths are not set
    std::set<TreePath, std::less<>> removed;

    bool empty() const { return staged.empty() && removed.empty(); }

    /// Whether what the index has at a path, conflicts included, goes.
    bool replace(char const* path) const { return removed.contains(path) || staged.contains(path); }
};

} // namespace project::git
