#include "repository/TrackedFiles.hpp"

namespace project::git {

git_index_entry const* trackedAt(git_index* index, TreePath const& path) {
    std::size_t position = 0;
    return git_index_find(&position, index, path.c_str()) == 0 ? git_index_get_byindex(index, position)
                                                               : nullptr;
}

std::size_t firstBelow(git_index* index, TreePath const& folder) {
    if (folder.empty()) {
        return 0;
    }
    std::size_t position = 0;
    bool const isFound = git_index_find_prefix(&position, index, (folder + '/').c_str()) == 0;
    return isFound ? position : git_index_entrycount(index);
}

} // namespace project::git
