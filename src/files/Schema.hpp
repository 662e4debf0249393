#pragma once

/// What the file subtree of a project's metadata is made of.
namespace project::management::files {

/// Type of the head of each scope. Its location is the scope's name.
inline constexpr char16_t const* FILES = u"Files";

/// Type of each element of a file's path.
inline constexpr char16_t const* FILE = u"File";

/// Type and location of the marker below a folder.
inline constexpr char16_t const* DIR_SIGNIFIER = u"DIR_SIGNIFIER";
inline constexpr char16_t const* DIR_SIGNIFIER_LOCATION = u"1";

/// The scope of the project's file list.
inline constexpr char16_t const* FILE_LIST_SCOPE = u"Root";

/// Type of a file's node and of a folder's marker.
inline constexpr char16_t const* NODE = u"Info";

} // namespace project::management::files
