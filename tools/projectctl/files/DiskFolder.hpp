#pragma once

#include "output/Kind.hpp"
#include "project/session/DiskFolder.hpp"

namespace projectctl {

using project::session::DiskEntry;
using project::session::isFolderItself;
using project::session::isOnDisk;
using project::session::readDiskFolder;

} // namespace projectctl
