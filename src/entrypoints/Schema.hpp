#pragma once

/// What the entry points and their groups in a project's metadata are made of.
namespace project::management::entrypoints {

/// Type of the head of the entry points, and of each entry point below it, whose UUID is the location.
inline constexpr char16_t const* ENTRY_POINTS = u"EntryPoints";
inline constexpr char16_t const* ENTRY_POINT = u"EntryPoint";

/// Type of the head of the groups, and of each group below it, whose UUID is the location.
inline constexpr char16_t const* GROUPS = u"EntryPointGroups";
inline constexpr char16_t const* GROUP = u"EntryPointGroup";

/// Location of both heads.
inline constexpr char16_t const* HEAD_LOCATION = u"Root";

/// Type of an entry point's and of a group's node.
inline constexpr char16_t const* NODE = u"Info";

/// Keys of an entry point.
inline constexpr char16_t const* FILE_KEY = u"File"; ///< relative to the project root, with "/" separators
inline constexpr char16_t const* NAME_KEY = u"Name";
inline constexpr char16_t const* TYPE_KEY = u"Type";
inline constexpr char16_t const* VISIBLE_KEY = u"Visible";
inline constexpr char16_t const* GROUP_UUID_KEY = u"GroupUUID";

/// Nested type and keys of one pair of an entry point's extension data.
inline constexpr char16_t const* EXTENSION = u"Extension";
inline constexpr char16_t const* EXTENSION_NAME_KEY = u"Name";
inline constexpr char16_t const* EXTENSION_VALUE_KEY = u"Value";

/// Key of a group.
inline constexpr char16_t const* GROUP_NAME_KEY = u"Name";

/// UUID of the default group, which is in every project and has no node.
inline constexpr char16_t const* DEFAULT_GROUP_UUID = u"default";

/// Values of VISIBLE_KEY.
inline constexpr char16_t const* VISIBLE = u"1";
inline constexpr char16_t const* HIDDEN = u"0";

} // namespace project::management::entrypoints
