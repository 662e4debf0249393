#pragma once

#include <cstddef>
#include <vector>

#include "files/DiskWalk.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Adds files and folders, and keeps the labels of the folders above them. The file manager would drop those.
/// Call it in a transaction.
/// @param added those of them that are in the project already are added again, without their labels.
void addBelowLabelledFolders(OpenProject& project, std::vector<Path> const& added);

/// Requires that the folders among the paths could be read. A folder that is not added need not be readable.
/// @throws Failure with the problem of the first one that could not.
void requireReadable(DiskWalk const& walk, std::vector<Path> const& paths);

/// Says on standard error which paths the project cannot contain.
void reportUnaddable(DiskWalk const& walk, Path const& root);

/// Adds everything below the root to a new project, except the files that git ignores if the root is in a
/// repository.
/// @return the number of files and folders.
std::size_t addWholeTree(OpenProject& project);

} // namespace projectctl
