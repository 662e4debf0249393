#pragma once

#include <string>

#include "fl/filesystem/Path.hpp"
#include "project/core/Export.hpp"
#include "project/core/Unique.hpp"

namespace project::management {

using fl::filesystem::Path;

/// A pointer from a project to a folder, in or outside of it: where the folder is on this machine, and the
/// text that is stored for it. An immutable value.
class PROJECT_MANAGEMENT_EXPORT FolderReference : public Unique {
public:
    /// A reference that was stored under this UUID.
    FolderReference(Path location, std::u16string type, std::u16string storedPath, std::u16string uuid);

    /// A new reference, under a fresh UUID. Callers use one of the two functions below.
    FolderReference(Path location, std::u16string type, std::u16string storedPath);

    std::u16string getUUID() const override;

    /// The folder on this machine. Lives as long as the reference, like the two below.
    Path const& getLocation() const { return location_; }

    /// How the stored path is to be read: "Relative" (to the project root) or "Absolute".
    std::u16string const& getType() const { return type_; }

    /// The text that is stored for the folder.
    std::u16string const& getStoredPath() const { return storedPath_; }

private:
    Path location_;
    std::u16string type_;
    std::u16string storedPath_;
    std::u16string uuid_;
};

/// A new reference that is stored relative to the project root, with "/" between elements, so that it goes
/// with the project. The target may lie outside the root, and need not exist. Its location is canonical.
/// @throws what fl::filesystem::canonical throws, for the target or the root.
PROJECT_MANAGEMENT_EXPORT FolderReference relativeFolderReference(Path const& target, Path const& root);

/// A new reference that is stored as the target is spelled here. Its location is canonical.
/// @throws what fl::filesystem::canonical throws.
PROJECT_MANAGEMENT_EXPORT FolderReference absoluteFolderReference(Path const& target);

} // namespace project::management
