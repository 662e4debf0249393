#include "project/MeantPath.hpp"

#include <string>
#include <vector>

#include "cli/Nearest.hpp"
#include "project/FileList.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

std::vector<std::u16string> namesIn(FileList const& list, Path const& folder) {
    std::vector<std::u16string> names;
    auto const level = list.level(list.addressOf(folder));
    for (auto const& entry : level.files) {
        if (entry.node) {
            names.emplace_back(level.nameOf(entry));
        }
    }
    return names;
}

} // namespace

std::optional<Path> meantPath(OpenProject& project, Path const& path) {
    if (path == project.root() || project.files().isFileInProject(path)) {
        return path;
    }
    if (!project::metadata::isParent(path, project.root())) {
        return std::nullopt;
    }
    auto const above = project::metadata::getParentFolder(path);
    auto const folder = meantPath(project, above); // also the folders above may be misspelt
    if (!folder) {
        return std::nullopt;
    }
    auto const name = project::metadata::getRelativePath(above, path);
    if (auto const same = *folder / Path(name); project.files().isFileInProject(same)) {
        return same;
    }
    auto const near = nearest(name, namesIn(FileList(project), *folder));
    return near ? std::optional(*folder / Path(*near)) : std::nullopt;
}

} // namespace projectctl
