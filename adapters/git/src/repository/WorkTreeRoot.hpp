#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "fl/filesystem/Path.hpp"

namespace project::git {

/// A path as git writes it in the index: the system's bytes, relative to the top of the work tree, elements
/// divided by single slashes. Empty for the top itself.
using TreePath = std::string;

/// The folder above an entry of the work tree; empty for one directly below the top.
TreePath parentOf(TreePath const& path);

/// The last element.
std::string_view nameOf(TreePath const& path);

/// Where the work tree lies, and what the paths of the library are in it.
class WorkTreeRoot {
public:
    /// @param workTree the top of the work tree, without symbolic links.
    /// @param projectRoot the project's folder as its users write it, perhaps by way of links.
    WorkTreeRoot(std::string const& workTree, fl::filesystem::Path const& projectRoot);

    /// Nothing for a path that is not in the work tree, or that nothing on disk can have.
    std::optional<TreePath> relative(fl::filesystem::Path const& path) const;

    /// The same, and nothing for a path outside the project's folder either. What a project lists comes from
    /// whoever wrote its text, and nothing elsewhere in the work tree may be staged for it.
    std::optional<TreePath> relativeInProject(fl::filesystem::Path const& path) const;

    /// The name on disk of an entry.
    std::string onDisk(TreePath const& path) const { return workTree_ + '/' + path; }

private:
    std::string workTree_; // without a slash at its end
    std::string givenRoot_;
    std::string realRoot_;
};

} // namespace project::git
