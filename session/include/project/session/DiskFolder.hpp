#pragma once

#include <string>
#include <string_view>
#include <system_error>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/session/Export.hpp"
#include "project/session/FileKind.hpp"

namespace project::session {

using fl::filesystem::Path;

/// A file or folder on disk that a project can contain. A symbolic link counts as a file.
struct DiskEntry {
    std::u16string name; ///< the name in its folder
    FileKind kind;       ///< a file or a folder
};

/// A folder that cannot be read.
struct UnreadableFolder {
    Path folder;             ///< absolute
    std::error_code problem; ///< why it cannot be read
};

/// The entries of a folder on disk, sorted by name in code units.
///
/// The data of source control and of project stores, sockets, pipes and devices are left out: they never
/// belong to a project. If the file system returns the kind of each entry with its name, only the folder
/// itself is read.
/// @throws std::system_error if the folder cannot be read.
PROJECT_SESSION_EXPORT std::vector<DiskEntry> readDiskFolder(Path const& folder);

/// Whether something exists at the path; a symbolic link is not followed. A path that cannot be checked for
/// lack of permission counts as existing.
PROJECT_SESSION_EXPORT bool isOnDisk(Path const& path);

/// The same for a name that the project lists in a folder. False, without access to the disk, for names that
/// cannot be in a folder and lead elsewhere: "..", ".", and names with a separator. A text that another
/// person wrote may contain them.
PROJECT_SESSION_EXPORT bool isOnDisk(Path const& folder, std::u16string const& name);

/// Whether a name can be that of a folder in a project: one element of a path, which does not lead elsewhere,
/// and not the data of source control or of a project store.
PROJECT_SESSION_EXPORT bool canBeInProject(std::u16string_view name);

/// Whether the path is a folder, not a symbolic link to one.
PROJECT_SESSION_EXPORT bool isFolderItself(Path const& path);

/// Whether a path is a folder that a project in a root folder can contain: the root or below it, on disk, not
/// behind a symbolic link, and not the data of source control or of a project store.
PROJECT_SESSION_EXPORT bool isFolderWithin(Path const& root, Path const& folder);

} // namespace project::session
