#pragma once

namespace project::session {

/// The kind of an entry of the file list: a folder if it was one when it was added. Everything that is not a
/// folder counts as a file, also a symbolic link to a folder.
enum class FileKind { File, Folder };

} // namespace project::session
