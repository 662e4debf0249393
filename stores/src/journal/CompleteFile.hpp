#pragma once

#include <string>
#include <string_view>

#include "fl/filesystem/Path.hpp"
#include "project/stores/Disk.hpp"

namespace project::stores {

/// Creates a file that is complete and durable as soon as it has its name.
/// @param temporary the name until then. A file that has it is deleted.
/// @return false if the name is taken.
bool createComplete(Disk& disk, std::string const& temporary, std::string const& name,
                    std::string_view content);

/// The absolute path of a file of the store's folder.
fl::filesystem::Path pathIn(Disk const& disk, std::string const& name);

} // namespace project::stores
