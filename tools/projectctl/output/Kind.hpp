#pragma once

namespace projectctl {

/// The kind of a file system entry. Everything that is not a folder counts as a file, also a symbolic link to
/// a folder.
enum class Kind { File, Folder };

} // namespace projectctl
