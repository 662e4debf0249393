#pragma once

#include <string>
#include <string_view>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

/// The one place that decides how the tool shows the path of a file of the project: relative to the current
/// folder, with "../" where needed, so that another command that is called there accepts it as an argument;
/// or relative to the root, with --full-name. JSON does not use this class: its paths are always relative to
/// the root. Errors show absolute paths.
class ShownPaths {
public:
    /// Paths in the form that the caller of the tool chose.
    /// @param root of the project that contains the current folder.
    /// @throws Failure if the current folder does not exist any more.
    explicit ShownPaths(fl::filesystem::Path root);

    /// Paths relative to the root, whatever the caller of the tool chose.
    static ShownPaths fromRoot(fl::filesystem::Path root);

    /// @param path relative to the root, and empty for the root; or, for a folder that the project stores so,
    ///        absolute, which is shown unchanged.
    /// @return valid until the next call, and as long as the argument. "." for the folder that the paths are
    ///         relative to.
    std::u16string_view of(std::u16string_view path);

    /// The same for an absolute path of a file of the project.
    std::u16string_view ofAbsolute(fl::filesystem::Path const& path);

private:
    ShownPaths(fl::filesystem::Path root, fl::filesystem::Path from);

    fl::filesystem::Path root_;
    fl::filesystem::Path from_; ///< the folder that shown paths are relative to
    bool isFromRoot_;
    std::u16string shown_; ///< the most recent result
};

} // namespace projectctl
