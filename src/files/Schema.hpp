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

/// Types of the children nested in a file's node: its categories, and below each its labels.
inline constexpr char16_t const* CATEGORY = u"Category";
inline constexpr char16_t const* LABEL = u"Label";

/// Keys of those children.
inline constexpr char16_t const* CATEGORY_UUID = u"UUID";
inline constexpr char16_t const* LABEL_UUID = u"UUID";

/// Key of the data on a label's child. It is read and never written here.
inline constexpr char16_t const* LABEL_VALUE = u"Value";

/// Type and location of the element below a file's address at which its data records lie. The records are
/// nested there, of any type; they are read and removed and never made here.
inline constexpr char16_t const* LABEL_DATA = u"LabelData";
inline constexpr char16_t const* LABEL_DATA_LOCATION = u"Data";

/// Keys of a data record: the UUID of the label that it belongs to, and the data.
inline constexpr char16_t const* RECORD_UUID = u"UUID";
inline constexpr char16_t const* RECORD_VALUE = u"Value";

} // namespace project::management::files
