#pragma once

#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "output/Kind.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// Something on disk that a project can hold: a file, a folder or a symbolic link, which counts as a file.
struct DiskEntry {
    std::u16string name;
    Kind kind;
};

/// What a folder on disk holds, by name in code units.
///
/// Left out is what never belongs to a project: what source control and the projects' own stores keep, and
/// sockets, pipes and devices. Asks the disk nothing but the folder's own entries, where the file system
/// tells the kind of each with its name.
/// @throws std::system_error when the folder cannot be read.
std::vector<DiskEntry> readDiskFolder(Path const& folder);

/// True when something is on disk under the path, which no last link is followed for. What cannot be seen,
/// for want of a permission, counts as there.
bool isOnDisk(Path const& path);

/// The same for what the project lists in a folder. False, without a question to the disk, for names that
/// nothing in a folder can have and that lead elsewhere: "..", ".", or one with a separator in it. A text
/// that somebody else made may hold them.
bool isOnDisk(Path const& folder, std::u16string const& name);

/// True when the path itself is a folder, and no symbolic link to one.
bool isFolderItself(Path const& path);

} // namespace projectctl
