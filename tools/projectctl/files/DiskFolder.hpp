#pragma once

#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "output/Kind.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// A file or folder on disk that a project can contain. A symbolic link counts as a file.
struct DiskEntry {
    std::u16string name;
    Kind kind;
};

/// The entries of a folder on disk, sorted by name in code units.
///
/// The data of source control and of project stores, sockets, pipes and devices are left out: they never
/// belong to a project. If the file system returns the kind of each entry with its name, only the folder
/// itself is read.
/// @throws std::system_error if the folder cannot be read.
std::vector<DiskEntry> readDiskFolder(Path const& folder);

/// Whether something exists at the path; a symbolic link is not followed. A path that cannot be checked for
/// lack of permission counts as existing.
bool isOnDisk(Path const& path);

/// The same for a name that the project lists in a folder. False, without access to the disk, for names that
/// cannot be in a folder and lead elsewhere: "..", ".", and names with a separator. A text that another
/// person wrote may contain them.
bool isOnDisk(Path const& folder, std::u16string const& name);

/// Whether the path is a folder, not a symbolic link to one.
bool isFolderItself(Path const& path);

} // namespace projectctl
