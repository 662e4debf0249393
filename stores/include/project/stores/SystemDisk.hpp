#pragma once

#include <memory>

#include "fl/filesystem/Path.hpp"
#include "project/stores/Disk.hpp"
#include "project/stores/Export.hpp"

namespace project::stores {

/// The Disk of a project on the file system.
/// @param projectRoot the project's root folder, canonical; it must exist when the store is first used.
/// @param folderName the name of the store's folder in the root.
PROJECT_STORES_EXPORT std::unique_ptr<Disk> makeSystemDisk(fl::filesystem::Path projectRoot,
                                                           fl::filesystem::Path folderName);

} // namespace project::stores
