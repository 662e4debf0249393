#include "repository/TrackedFiles.hpp"

namespace project::git {

std::optional<git_index_entry> trackedAt(IndexContent const& index, TreePath const& path) {
    std::size_t const position = index.firstFrom(path);
    bool const isTracked = position < index.size() && index.pathAt(position) == path;
    return isTracked ? std::optional(index.at(position)) : std::nullopt;
}

std::size_t firstBelow(IndexContent const& index, TreePath const& folder) {
    if (folder.empty()) {
        return 0;
    }
    std::size_t const position = index.firstFrom(folder + '/');
    return position < index.size() && isBelow(index.pathAt(position), folder) ? position : index.size();
}

} // namespace project::git
