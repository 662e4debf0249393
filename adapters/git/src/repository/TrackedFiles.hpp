#pragma once

#include <cstddef>

#include "repository/LibGit.hpp"
#include "repository/WorkTreeRoot.hpp"

namespace project::git {

/// The entry of the index for a path, or the first one of a conflict; null if there is none.
git_index_entry const* trackedAt(git_index* index, TreePath const& path);

/// The position of the first entry below a folder; the number of entries if there is none.
std::size_t firstBelow(git_index* index, TreePath const& folder);

inline bool isBelow(char const* entry, TreePath const& folder) {
    return folder.empty() ||
           (TreePath::traits_type::length(entry) > folder.size() &&
            folder.compare(0, folder.size(), entry, folder.size()) == 0 && entry[folder.size()] == '/');
}

inline bool isAnythingTrackedBelow(git_index* index, TreePath const& folder) {
    return firstBelow(index, folder) < git_index_entrycount(index);
}

inline bool isSubmodule(git_index_entry const& entry) {
    return entry.mode == GIT_FILEMODE_COMMIT;
}

} // namespace project::git
