#pragma once

#include <cstddef>
#include <vector>

#include "files/DiskWalk.hpp"
#include "output/Progress.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Requires that the folders among the paths could be read. A folder that is not added need not be readable.
/// @throws Failure with the problem of the first one that could not.
void requireReadable(DiskWalk const& walk, std::vector<Path> const& paths);

/// What a walk has found, without the paths that the project cannot contain; says on standard error which
/// these are.
/// @param leavesOutIgnored whether files that git ignores are left out.
/// @throws Failure if a folder among the result could not be read.
std::vector<Path> contentsToAdd(DiskWalk const& walk, Path const& root, bool leavesOutIgnored,
                                Progress& progress);

/// Adds everything below the root to a new project, except the files that git ignores if the root is in a
/// repository.
/// @return the number of files and folders.
std::size_t addWholeTree(OpenProject& project);

} // namespace projectctl
