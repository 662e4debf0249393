#include "files/PathSets.hpp"

#include <iterator>
#include <set>
#include <utility>

#include "project/metadata/MetadataFunctions.hpp"

namespace project::management {

namespace {

using PathSet = std::set<Path>;

/// Moves the elements of the set to a list.
std::vector<Path> toList(PathSet set) {
    std::vector<Path> result;
    result.reserve(set.size());
    while (!set.empty()) {
        result.push_back(std::move(set.extract(set.begin()).value()));
    }
    return result;
}

/// Inserts a path near the end, which is where it belongs in a sorted list.
/// @return false if the set contained the path.
bool insertNearEnd(Path const& path, PathSet& result) {
    std::size_t const before = result.size();
    result.emplace_hint(result.end(), path);
    return result.size() > before;
}

} // namespace

bool isWithinFolder(Path const& folder, Path const& path) {
    return !metadata::getRelativePath(folder, path).starts_with(u"..");
}

std::vector<Path> withParentFolders(std::vector<Path> const& files, Path const& root) {
    PathSet result;
    Path known = root; // a folder that the set contains with all folders above it, or the root
    for (auto const& file : files) {
        if (!isWithinFolder(root, file)) {
            result.insert(file);
            continue;
        }
        if (file == root || !insertNearEnd(file, result)) {
            continue;
        }
        Path const folder = metadata::getParentFolder(file);
        Path path = folder;
        while (path != known && path != root && result.insert(path).second) {
            path = metadata::getParentFolder(path);
        }
        known = folder;
    }
    return toList(std::move(result));
}

std::vector<Path> withDescendants(std::vector<Path> const& files,
                                  std::function<std::vector<Path>(Path const&)> const& getChildFiles) {
    struct Waiting {
        Path path;
        PathSet::const_iterator folder; // the end for the given paths
    };

    PathSet result;
    std::vector<Waiting> waiting;
    waiting.reserve(files.size());
    for (auto const& file : files) {
        waiting.push_back({file, result.end()});
    }
    while (!waiting.empty()) {
        Waiting next = std::move(waiting.back());
        waiting.pop_back();
        std::vector<Path> children = getChildFiles(next.path);
        // Children are popped from the last to the first, so each belongs directly after its folder.
        auto const hint = next.folder == result.end() ? result.end() : std::next(next.folder);
        auto const inserted = result.emplace_hint(hint, std::move(next.path));
        for (auto& child : children) {
            waiting.push_back({std::move(child), inserted});
        }
    }
    return toList(std::move(result));
}

} // namespace project::management
