#pragma once

#include <set>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// Whether there is a regular file or a symbolic link at a path.
bool isFileOnDisk(Path const& path);

/// The files below a folder, relative to it, without those of a set, the store's own and git's. Folders that
/// cannot be read are left out.
std::vector<std::u16string> filesOnDisk(Path const& root, std::set<std::u16string> const& without);

} // namespace projectctl
