#pragma once

#include <string>

#include "fl/filesystem/Path.hpp"
#include "project/core/Export.hpp"
#include "project/core/Unique.hpp"

namespace project::management {

using fl::filesystem::Path;

/// A reference from a project to a folder, inside or outside of it: the folder's location on this machine,
/// and the text that is stored for it. An immutable value.
class PROJECT_MANAGEMENT_EXPORT FolderReference : public Unique {
public:
    /// A reference that is stored under this UUID.
    FolderReference(Path location, std::u16string type, std::u16string storedPath, std::u16string uuid);

    /// A reference with a new UUID. Callers use one of the two functions below.
    FolderReference(Path location, std::u16string type, std::u16string storedPath);

    std::u16string getUUID() const override;

    /// Returns the folder on this machine, absolute.
    Path const& getLocation() const { return location_; }

    /// Returns the type of the stored path: "Relative" (to the project's root) or "Absolute".
    std::u16string const& getType() const { return type_; }

    /// Returns the text that is stored for the folder.
    std::u16string const& getStoredPath() const { return storedPath_; }

private:
    Path location_;
    std::u16string type_;
    std::u16string storedPath_;
    std::u16string uuid_;
};

/// Returns a new reference whose stored path is relative to the project's root, with "/" between elements, so
/// that it stays valid when the project is moved together with the target. The target may be outside the
/// root, and may not exist. The location is canonical.
/// @param target absolute, or relative to the working directory.
/// @throws std::filesystem::filesystem_error as fl::filesystem::canonical does, for the target or the root.
PROJECT_MANAGEMENT_EXPORT FolderReference relativeFolderReference(Path const& target, Path const& root);

/// Returns a new reference whose stored path is the target's text, deliberately unchanged: an absolute
/// reference names a place, such as a drive or a link, and not its present content. The location is
/// canonical.
/// @throws std::filesystem::filesystem_error as fl::filesystem::canonical does.
PROJECT_MANAGEMENT_EXPORT FolderReference absoluteFolderReference(Path const& target);

} // namespace project::management
