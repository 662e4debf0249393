#pragma once

#include <string>

#include "fl/filesystem/Path.hpp"
#include "project/metadata/Export.hpp"

namespace project::metadata {

using fl::filesystem::Path;

/// True when a file, a folder or a symbolic link (wherever it leads) is on disk under this path. False, and
/// never an exception, for what cannot be there. One system call.
PROJECT_METADATA_EXPORT bool exists(Path const& path);

/// True when the path is a folder on disk, or a symbolic link to one. False, and never an exception, for
/// what cannot be there. One system call.
PROJECT_METADATA_EXPORT bool is_directory(Path const& path);

/// The containing folder, by the text alone: "/a" for "/a/b", "/" for "/a" and for "/", empty for "a".
PROJECT_METADATA_EXPORT Path getParentFolder(Path const& path);

/// The target relative to the base, by the text alone, with "/" between elements. Empty when both have the
/// same elements; begins with ".." when the target is neither the base nor below it.
PROJECT_METADATA_EXPORT std::u16string getRelativePath(Path const& base, Path const& target);

/// True when the folder lies above the path, by the text alone; false when both are the same.
PROJECT_METADATA_EXPORT bool isParent(Path const& path, Path const& folder);

/// A fresh random UUID (version 4) as 36 lower-case characters. Thread-safe.
PROJECT_METADATA_EXPORT std::u16string generateUUID();

} // namespace project::metadata
