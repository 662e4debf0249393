#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "fl/filesystem/Path.hpp"

namespace project::git {

/// A path as git stores it in the index: the system's bytes, relative to the top of the work tree, with
/// single slashes. Empty for the top itself.
using TreePath = std::string;

/// The folder above an entry of the work tree; empty for one directly below the top.
TreePath parentOf(TreePath const& path);

/// The last element.
std::string_view nameOf(TreePath const& path);

/// The position of the work tree on disk. Converts the library's paths to paths in the work tree.
class WorkTreeRoot {
public:
    /// @param workTree the top of the work tree, without symbolic links.
    /// @param projectRoot the project's folder as the caller gave it, possibly through links.
    WorkTreeRoot(std::string const& workTree, fl::filesystem::Path const& projectRoot);

    /// Nothing for a path outside the work tree, and for one that has no name on disk.
    std::optional<TreePath> relative(fl::filesystem::Path const& path) const;

    /// The same, and nothing for a path outside the project's folder. The paths come from the project's text,
    /// which anybody may have written; it must not cause changes elsewhere in the work tree.
    std::optional<TreePath> relativeInProject(fl::filesystem::Path const& path) const;

    /// The absolute name of an entry on disk.
    std::string onDisk(TreePath const& path) const { return workTree_ + '/' + path; }

private:
    std::string workTree_; // without a slash at the end
    std::string givenRoot_;
    std::string realRoot_;
};

} // namespace project::git
