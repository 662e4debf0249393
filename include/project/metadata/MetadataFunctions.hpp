#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "fl/filesystem/Path.hpp"
#include "project/metadata/Export.hpp"

namespace project::metadata {

using fl::filesystem::Path;

/// Returns true if the path exists on disk, as a file, a folder or a symbolic link (also a dangling one). A
/// path that cannot exist (too long, no permission) gives false and not an exception. Makes one system call.
PROJECT_METADATA_EXPORT bool exists(Path const& path);

/// Returns true if the path is a folder on disk, or a symbolic link to one. A path that cannot exist gives
/// false and not an exception. Makes one system call.
PROJECT_METADATA_EXPORT bool is_directory(Path const& path);

/// Returns the folder that contains the path, from the text alone: "/a" for "/a/b", "/" for "/a" and for "/",
/// and an empty path for "a".
PROJECT_METADATA_EXPORT Path getParentFolder(Path const& path);

/// Returns the target relative to the base, from the text alone, with "/" between elements. The result is
/// empty if both have the same elements, and begins with ".." if the target is neither the base nor below it.
PROJECT_METADATA_EXPORT std::u16string getRelativePath(Path const& base, Path const& target);

/// Returns true if the target relative to the base begins with "..", without creating that text.
PROJECT_METADATA_EXPORT bool leadsUpward(Path const& base, Path const& target) noexcept;

/// Returns the same as getRelativePath, as a part of the target's text. Nothing if the target is not below
/// the base, or if its text is not such a part: for example, if separators are repeated.
PROJECT_METADATA_EXPORT std::optional<std::u16string_view> textBelow(Path const& base,
                                                                     Path const& target) noexcept;

/// Returns true if the path is below the folder, from the text alone. A path is not below itself.
PROJECT_METADATA_EXPORT bool isParent(Path const& path, Path const& folder);

/// Returns a new random UUID (version 4), 36 lower-case characters. Any thread may call it.
PROJECT_METADATA_EXPORT std::u16string generateUUID();

} // namespace project::metadata
