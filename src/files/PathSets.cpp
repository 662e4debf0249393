#include "files/PathSets.hpp"

#include <set>
#include <utility>

#include "project/metadata/MetadataFunctions.hpp"

namespace project::management {

namespace {

void insertUpToRoot(Path path, Path const& root, std::set<Path>& result) {
    while (path != root && result.insert(path).second) {
        path = metadata::getParentFolder(path);
    }
}

} // namespace

bool isWithinFolder(Path const& folder, Path const& path) {
    return !metadata::getRelativePath(folder, path).starts_with(u"..");
}

std::vector<Path> withParentFolders(std::vector<Path> const& files, Path const& root) {
    std::set<Path> result;
    for (auto const& file : files) {
        if (isWithinFolder(root, file)) {
            insertUpToRoot(file, root, result);
        } else {
            result.insert(file);
        }
    }
    return {result.begin(), result.end()};
}

std::vector<Path> withDescendants(std::vector<Path> const& files,
                                  std::function<std::vector<Path>(Path const&)> const& getChildFiles) {
    std::set<Path> result;
    std::vector<Path> waiting = files;
    while (!waiting.empty()) {
        auto const path = std::move(waiting.back());
        waiting.pop_back();
        result.insert(path);
        for (auto& child : getChildFiles(path)) {
            waiting.push_back(std::move(child));
        }
    }
    return {result.begin(), result.end()};
}

} // namespace project::management
