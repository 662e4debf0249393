#pragma once

#include <map>
#include <string>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// Makes the paths of arguments absolute, in the form of the project's root.
///
/// The folder part is resolved, so that the same file gets the same path whichever way it was named. The last
/// element stays as it is, so that a symbolic link is itself and not what it leads to; but "." and "..", and
/// what stands before a trailing slash, name a folder and are resolved.
class ArgumentPaths {
public:
    /// @param from the folder that relative paths start from, canonical.
    explicit ArgumentPaths(Path from);

    /// @param argument bytes as the system has them.
    /// @throws Failure for an empty argument.
    Path absolute(std::string const& argument);

private:
    Path const& resolved(std::string const& folder);

    Path from_;
    std::map<std::string, Path> resolved_; ///< thousands of arguments share a few folders
};

} // namespace projectctl
