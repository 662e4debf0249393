#pragma once

#include <functional>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/core/Export.hpp"

namespace project::management {

using fl::filesystem::Path;

/// True when the path is the folder or lies below it, by the text alone: when the path relative to the folder
/// does not begin with "..". So a path whose first name below the folder begins with two dots counts as
/// outside.
bool isWithinFolder(Path const& folder, Path const& path);

/// The files together with all the folders between them and the root, which itself is left out. A path
/// outside the root comes alone. In Path order, each once.
std::vector<Path> withParentFolders(std::vector<Path> const& files, Path const& root);

/// The files together with everything below them, as getChildFiles tells. In Path order, each once.
std::vector<Path> withDescendants(std::vector<Path> const& files,
                                  std::function<std::vector<Path>(Path const&)> const& getChildFiles);

} // namespace project::management
