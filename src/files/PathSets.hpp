#pragma once

#include <functional>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/core/Export.hpp"

namespace project::management {

using fl::filesystem::Path;

/// Returns true if the path is the folder or below it, from the text alone: if the path relative to the
/// folder does not begin with "..". A path whose first name below the folder begins with two dots therefore
/// counts as outside.
bool isWithinFolder(Path const& folder, Path const& path);

/// Returns the files and all folders between them and the root, without the root itself and without the
/// folders above a path outside the root. In Path order, without duplicates.
std::vector<Path> withParentFolders(std::vector<Path> const& files, Path const& root);

/// Returns the files and everything below them, as getChildFiles lists it. In Path order, without duplicates.
std::vector<Path> withDescendants(std::vector<Path> const& files,
                                  std::function<std::vector<Path>(Path const&)> const& getChildFiles);

} // namespace project::management
