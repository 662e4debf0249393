#pragma once

#include <set>

#include "fl/filesystem/Path.hpp"

namespace project::management {

using fl::filesystem::Path;

/// The files that source control gets with the next notification of the store, absolute.
struct NotedFiles {
    std::set<Path> additions; ///< files to place under source control
    std::set<Path> removals;  ///< files to remove from source control
};

} // namespace project::management
