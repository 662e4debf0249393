#pragma once

#include <set>

#include "fl/filesystem/Path.hpp"

namespace project::management {

using fl::filesystem::Path;

/// The files that source control gets with the next notification of the store, absolute.
struct NotedFiles {
    std::set<Path> additions;
    std::set<Path> removals;
};

} // namespace project::management
