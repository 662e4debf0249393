#include "files/PathSets.hpp"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <set>
#include <utility>

#include "project/metadata/MetadataFunctions.hpp"

namespace project::management {

namespace {

using Place = std::vector<Path>::iterator;

/// Divides the paths into runs, in each of which a path precedes the next one. @return where the runs begin,
/// and the end of the last one.
std::vector<Place> ascendingRuns(std::vector<Path>& paths) {
    auto const isNotBefore = [](Path const& left, Path const& right) { return !(left < right); };
    std::vector<Place> bounds{paths.begin()};
    while (bounds.back() != paths.end()) {
        auto const last = std::adjacent_find(bounds.back(), paths.end(), isNotBefore);
        bounds.push_back(last == paths.end() ? last : std::next(last));
    }
    return bounds;
}

/// Merges each run with the next one. @return the bounds of the merged runs.
std::vector<Place> mergeNeighbours(std::vector<Place> const& bounds) {
    std::vector<Place> merged{bounds.front()};
    for (std::size_t run = 2; run < bounds.size(); run += 2) {
        std::inplace_merge(bounds[run - 2], bounds[run - 1], bounds[run]);
        merged.push_back(bounds[run]);
    }
    if (merged.back() != bounds.back()) {
        merged.push_back(bounds.back()); // a run without a partner
    }
    return merged;
}

/// Sorts the paths and removes duplicates. Most lists are sorted already, or consist of a few runs: a list of
/// numbered files begins a new run where the numbers get another digit.
void makeSet(std::vector<Path>& paths) {
    auto bounds = ascendingRuns(paths);
    if (bounds.size() <= 2) {
        return;
    }
    while (bounds.size() > 2) {
        bounds = mergeNeighbours(bounds);
    }
    paths.erase(std::unique(paths.begin(), paths.end()), paths.end());
}

/// Paths in a list into which each is inserted directly after another one.
class LinkedPaths {
public:
    /// The place before the first path.
    static constexpr std::size_t front = 0;

    /// @return the place of the path.
    std::size_t insertAfter(std::size_t place, Path path) {
        paths_.push_back({std::move(path), std::exchange(paths_[place].next, paths_.size())});
        return paths_.size() - 1;
    }

    std::vector<Path> take() {
        std::vector<Path> result;
        result.reserve(paths_.size() - 1);
        for (auto place = paths_[front].next; place != front; place = paths_[place].next) {
            result.push_back(std::move(paths_[place].path));
        }
        return result;
    }

private:
    struct Linked {
        Path path;
        std::size_t next; ///< the front at the end
    };

    std::vector<Linked> paths_{{Path(), front}};
};

} // namespace

bool isWithinFolder(Path const& folder, Path const& path) {
    return !metadata::leadsUpward(folder, path);
}

std::vector<Path> withParentFolders(std::vector<Path> const& files, Path const& root) {
    std::vector<Path> result;
    result.reserve(files.size() + files.size() / 8);
    std::set<Path> folders; // that the result contains
    std::vector<Path> missing;
    Path known = root; // a folder that the result contains with all folders above it, or the root
    for (auto const& file : files) {
        if (file == root) {
            continue;
        }
        if (isWithinFolder(root, file)) {
            Path folder = metadata::getParentFolder(file);
            for (Path path = folder; path != known && path != root && folders.insert(path).second;) {
                missing.push_back(path);
                path = metadata::getParentFolder(path);
            }
            std::move(missing.rbegin(), missing.rend(), std::back_inserter(result));
            missing.clear();
            known = std::move(folder);
        }
        result.push_back(file);
    }
    makeSet(result);
    return result;
}

std::vector<Path> withDescendants(std::vector<Path> const& files,
                                  std::function<std::vector<Path>(Path const&)> const& getChildFiles) {
    struct Waiting {
        Path path;
        std::size_t folder; ///< its place
    };

    LinkedPaths result;
    std::vector<Waiting> waiting;
    waiting.reserve(files.size());
    for (auto const& file : files) {
        waiting.push_back({file, LinkedPaths::front});
    }
    while (!waiting.empty()) {
        Waiting next = std::move(waiting.back());
        waiting.pop_back();
        std::vector<Path> children = getChildFiles(next.path);
        // Children are popped from the last to the first, so each belongs directly after its folder.
        auto const place = result.insertAfter(next.folder, std::move(next.path));
        for (auto& child : children) {
            waiting.push_back({std::move(child), place});
        }
    }
    auto paths = result.take();
    makeSet(paths);
    return paths;
}

} // namespace project::management
