#pragma once

#include <vector>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// Takes out of a list what git ignores in the repository that the project lies in: what matches a pattern,
/// or lies in a folder that does, and is not tracked all the same.
///
/// One process of git for the whole list, and a second one if anything matches.
/// @param root the project's root.
/// @param paths below the root, none beyond a symbolic link. They keep their order.
/// @throws Failure when git is missing, fails, or knows of no repository here.
std::vector<Path> withoutIgnoredByGit(Path const& root, std::vector<Path> paths);

} // namespace projectctl
