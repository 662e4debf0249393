#pragma once

#include "fl/filesystem/Path.hpp"

namespace project::git {

/// A file, or a folder with everything below it, that was moved on disk. Both paths are absolute.
struct FileMove {
    fl::filesystem::Path from; ///< the old path, absolute
    fl::filesystem::Path to;   ///< the new path, absolute
};

} // namespace project::git
