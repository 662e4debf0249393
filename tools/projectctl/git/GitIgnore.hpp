#pragma once

#include <vector>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// Whether git is installed and the folder is in the work tree of a repository.
bool isInGitRepository(Path const& folder);

/// Removes from a list the paths that git ignores in the project's repository: those that match a pattern, or
/// lie in a folder that does, and are not tracked.
///
/// Runs git once for the whole list, and a second time if any path matches.
/// @param root the project's root.
/// @param paths below the root, none of them below a symbolic link.
/// @return the others, in the same order.
/// @throws Failure when git is not installed or fails, or when the root is not in a repository.
std::vector<Path> withoutIgnoredByGit(Path const& root, std::vector<Path> paths);

} // namespace projectctl
