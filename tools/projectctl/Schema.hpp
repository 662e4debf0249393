#pragma once

/// What the tool knows of a project's tree, for when it looks at it without the managers: to list at the
/// speed of the store, and to check what a manager would stumble over.
namespace projectctl::schema {

inline constexpr char16_t const* root = u"Root"; ///< location of the heads, scope of the file list

inline constexpr char16_t const* files = u"Files";
inline constexpr char16_t const* file = u"File";
inline constexpr char16_t const* folderMarker = u"DIR_SIGNIFIER";

inline constexpr char16_t const* categories = u"Categories";
inline constexpr char16_t const* category = u"Category";
inline constexpr char16_t const* label = u"Label";
inline constexpr char16_t const* entryPoints = u"EntryPoints";
inline constexpr char16_t const* entryPointGroups = u"EntryPointGroups";
inline constexpr char16_t const* projectPath = u"ProjectPath";
inline constexpr char16_t const* references = u"References";

inline constexpr char16_t const* fileKey = u"File";
inline constexpr char16_t const* uuidKey = u"UUID";
inline constexpr char16_t const* readOnlyKey = u"ReadOnly";
inline constexpr char16_t const* typeKey = u"Type";

} // namespace projectctl::schema
