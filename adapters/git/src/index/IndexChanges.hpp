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

    /// Those of the staged ones whose content was not read: entries of files that were moved.
    std::set<TreePath, std::less<>> moved;

    bool empty() const { return staged.empty() && removed.empty(); }
};

} // namespace project::git
