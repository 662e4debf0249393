#pragma once

#include <map>
#include <string>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// Converts path arguments to absolute paths, in the form of the project's root.
///
/// Symbolic links in the folder part are resolved, so that a file has the same path however it was named. The
/// last element is not resolved: an argument that names a symbolic link means the link. "." and "..", and the
/// part before a trailing slash, always name a folder and are resolved.
class ArgumentPaths {
public:
    /// @param from the folder to which relative paths are relative, canonical.
    explicit ArgumentPaths(Path from);

    /// @param argument bytes as on disk.
    /// @throws Failure for an empty argument.
    Path absolute(std::string const& argument);

private:
    Path const& resolved(std::string const& folder);

    Path from_;
    std::map<std::string, Path> resolved_; ///< by folder: thousands of arguments share a few
};

} // namespace projectctl
