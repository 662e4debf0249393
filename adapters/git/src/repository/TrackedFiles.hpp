#pragma once

#include <cstddef>
#include <optional>

#include "repository/IndexContent.hpp"
#include "repository/LibGit.hpp"
#include "repository/WorkTreeRoot.hpp"

namespace project::git {

/// The entry of the index for a path, or the first one of a conflict; nothing if there is none. Its path is
/// valid as long as the index.
std::optional<git_index_entry> trackedAt(IndexContent const& index, TreePath const& path);

/// The position of the first entry below a folder; the number of entries if there is none.
std::size_t firstBelow(IndexContent const& index, TreePath const& folder);

inline bool isBelow(char const* entry, TreePath const& folder) {
    return folder.empty() ||
           (TreePath::traits_type::length(entry) > folder.size() &&
            folder.compare(0, folder.size(), entry, folder.size()) == 0 && entry[folder.size()] == '/');
}

inline bool isAnythingTrackedBelow(IndexContent const& index, TreePath const& folder) {
    return firstBelow(index, folder) < index.size();
}

inline bool isSubmodule(git_index_entry const& entry) {
    return entry.mode == GIT_FILEMODE_COMMIT;
}

} // namespace project::git
