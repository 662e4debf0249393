#pragma once

/// What the session knows of a project's tree, to tell which kind of change a difference in it is.
namespace project::session::schema {

/// Type of the file list's head, its scope, and the type of each element of a file's path below it. What else
/// lies below a file belongs to it.
inline constexpr char16_t const* FILES = u"Files";
inline constexpr char16_t const* FILE_LIST_SCOPE = u"Root";
inline constexpr char16_t const* FILE = u"File";

/// Type of the marker that stands for a folder, below its path.
inline constexpr char16_t const* DIR_SIGNIFIER = u"DIR_SIGNIFIER";

/// Type of the head of the categories, which lie below it by UUID, their labels below them in the same way.
inline constexpr char16_t const* CATEGORIES = u"Categories";

/// Types of the heads of what has one event for all of it.
inline constexpr char16_t const* ENTRY_POINTS = u"EntryPoints";
inline constexpr char16_t const* ENTRY_POINT_GROUPS = u"EntryPointGroups";
inline constexpr char16_t const* PROJECT_PATH = u"ProjectPath";
inline constexpr char16_t const* REFERENCES = u"References";

} // namespace project::session::schema
