#pragma once

#include <string>
#include <vector>

#include "output/Kind.hpp"
#include "project/session/DiskFolder.hpp"

namespace projectctl {

using fl::filesystem::Path;
using project::session::DiskEntry;
using project::session::isFolderItself;
using project::session::isOnDisk;

/// The line for the user about a folder that cannot be read.
std::string problemOf(project::session::UnreadableFolder const& unreadable);

/// As project::session::readDiskFolder, with an error in the language of the user.
std::vector<DiskEntry> readDiskFolder(Path const& folder);

} // namespace projectctl
