#pragma once

#include <string>
#include <string_view>

/// What the tool knows of a project's tree, for when it looks at it without the managers: to list at the
/// speed of the store, and to check what a manager would stumble over.
namespace projectctl::schema {

inline constexpr std::u16string_view root = u"Root"; ///< location of the heads, scope of the file list

inline constexpr std::u16string_view files = u"Files";
inline constexpr std::u16string_view file = u"File";
inline constexpr std::u16string_view folderMarker = u"DIR_SIGNIFIER";

inline constexpr std::u16string_view categories = u"Categories";
inline constexpr std::u16string_view category = u"Category";
inline constexpr std::u16string_view label = u"Label";
inline constexpr std::u16string_view entryPoints = u"EntryPoints";
inline constexpr std::u16string_view entryPointGroups = u"EntryPointGroups";
inline constexpr std::u16string_view projectPath = u"ProjectPath";
inline constexpr std::u16string_view reference = u"Reference";
inline constexpr std::u16string_view references = u"References";

inline std::u16string const fileKey = u"File";
inline std::u16string const nameKey = u"Name";
inline std::u16string const singleValuedKey = u"SingleValued";
inline std::u16string const uuidKey = u"UUID";
inline std::u16string const readOnlyKey = u"ReadOnly";
inline std::u16string const groupKey = u"GroupUUID";
inline std::u16string const typeKey = u"Type";

} // namespace projectctl::schema
