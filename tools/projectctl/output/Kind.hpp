#pragma once

namespace projectctl {

/// What a path leads to. Whatever is no folder counts as a file, a symbolic link to a folder too.
enum class Kind { File, Folder };

} // namespace projectctl
