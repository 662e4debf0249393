#pragma once

/// The types, locations, keys and fixed values of a project's tree, by subject. docs/tree.md shows the tree
/// that they form.
///
/// A step of an address is a type and a location. A constant `...Type` is the type of a step or a node,
/// `...Location` the location of a step, and `...Key` a key of a node. Every constant converts to
/// std::u16string and to std::u16string_view. Several subjects use the same word ("Name", "Root", "File") for
/// different things, so each has a constant of its own: the position in the tree says which one applies.
namespace project::metadata::schema {

/// Type of every node that has one, except nested nodes. The nodes of the name and of the description have
/// none.
inline constexpr char16_t const* nodeType = u"Info";

/// Location of the first step of the categories, entry points, groups, project path and references.
inline constexpr char16_t const* rootLocation = u"Root";

} // namespace project::metadata::schema

/// The project's name and description, each a node of its own: setting one leaves the other alone.
namespace project::metadata::schema::information {

/// The only step of the name's address, and the name's key.
inline constexpr char16_t const* nameType = u"Info";
inline constexpr char16_t const* nameLocation = u"ProjectData"; ///< the location of that step
inline constexpr char16_t const* nameKey = u"Name";             ///< the key of the name

/// The two steps of the description's address, and the description's key. It is the only key in lower case.
inline constexpr char16_t const* extensionsType = u"Root";
inline constexpr char16_t const* extensionsLocation = u"Extensions";   ///< the location of the first step
inline constexpr char16_t const* descriptionType = u"Extension";       ///< the type of the second step
inline constexpr char16_t const* descriptionLocation = u"Information"; ///< the location of the second step
inline constexpr char16_t const* descriptionKey = u"description";      ///< the key of the description

} // namespace project::metadata::schema::information

/// Files and folders, in scopes. The file list is one scope; applications store data for each file in others.
namespace project::metadata::schema::files {

/// Type of the first step. Its location is the name of the scope.
inline constexpr char16_t const* filesType = u"Files";

/// The scope of the project's file list.
inline constexpr char16_t const* fileListScope = u"Root";

/// Type of each further step of a file or folder. Its location is one element of the path from the root.
inline constexpr char16_t const* fileType = u"File";

/// The step of the marker below a folder. Its node has no keys.
inline constexpr char16_t const* markerType = u"DIR_SIGNIFIER";
inline constexpr char16_t const* markerLocation = u"1"; ///< the location of that step

/// A nested node of a file in the file list: a category of which the file has labels.
inline constexpr char16_t const* categoryType = u"Category";
inline constexpr char16_t const* categoryUUIDKey = u"UUID"; ///< the category

/// A nested node of such a category: a label of the file. The managers read its value and never write it.
inline constexpr char16_t const* labelType = u"Label";
inline constexpr char16_t const* labelUUIDKey = u"UUID";   ///< the label
inline constexpr char16_t const* labelValueKey = u"Value"; ///< its value

/// The step of a file's label data. The nested nodes of its node are the records, of any type. The managers
/// read and remove records and never write them.
inline constexpr char16_t const* labelDataType = u"LabelData";
inline constexpr char16_t const* labelDataLocation = u"Data"; ///< the location of that step
inline constexpr char16_t const* recordUUIDKey = u"UUID";     ///< the label that the record belongs to
inline constexpr char16_t const* recordValueKey = u"Value";   ///< the data

} // namespace project::metadata::schema::files

/// The rules of folders that keep themselves up to date: each a node of its folder, in a scope of its own.
namespace project::metadata::schema::sync {

/// The scope of the rules.
inline constexpr char16_t const* rulesScope = u"SyncRules";

/// A key of a rule. Any text but gitIgnoreOff, and none, says that git's ignore rules apply.
inline constexpr char16_t const* gitIgnoreKey = u"GitIgnore";
inline constexpr char16_t const* gitIgnoreOff = u"0"; ///< git's ignore rules do not apply

/// Nested nodes of a rule: one pattern each. Their identity is their content, so that the patterns of two
/// people merge like two sets.
inline constexpr char16_t const* includeType = u"Include";
inline constexpr char16_t const* excludeType = u"Exclude"; ///< a pattern of files that are not added
inline constexpr char16_t const* patternKey = u"Pattern";  ///< the pattern

} // namespace project::metadata::schema::sync

/// Categories and their labels. The location of the first step is rootLocation.
namespace project::metadata::schema::categories {

/// Type of the first step. No node is stored there.
inline constexpr char16_t const* categoriesType = u"Categories";

/// A category, by UUID.
inline constexpr char16_t const* categoryType = u"Category";
inline constexpr char16_t const* categoryNameKey = u"Name";         ///< the name that users see
inline constexpr char16_t const* categoryDataTypeKey = u"DataType"; ///< the type of the data of its labels
inline constexpr char16_t const* categoryReadOnlyKey = u"ReadOnly"; ///< flagTrue or flagFalse
inline constexpr char16_t const* categorySingleValuedKey = u"SingleValued"; ///< flagTrue or flagFalse

/// A label below its category, by UUID.
inline constexpr char16_t const* labelType = u"Label";
inline constexpr char16_t const* labelNameKey = u"Name";         ///< the name that users see
inline constexpr char16_t const* labelReadOnlyKey = u"ReadOnly"; ///< the text of a LabelReadOnlyState

/// The two texts of a flag. Any other text counts as flagFalse.
inline constexpr char16_t const* flagTrue = u"1";
inline constexpr char16_t const* flagFalse = u"0"; ///< no

} // namespace project::metadata::schema::categories

/// Entry points and their groups, in two subtrees. The location of the first step is rootLocation.
namespace project::metadata::schema::entrypoints {

/// Type of the first step of the entry points. No node is stored there.
inline constexpr char16_t const* entryPointsType = u"EntryPoints";

/// An entry point, by UUID.
inline constexpr char16_t const* entryPointType = u"EntryPoint";
inline constexpr char16_t const* fileKey = u"File";           ///< relative to the project's root, with "/"
inline constexpr char16_t const* nameKey = u"Name";           ///< the name that users see
inline constexpr char16_t const* typeKey = u"Type";           ///< the name of an EntryPointType
inline constexpr char16_t const* visibleKey = u"Visible";     ///< visible or hidden
inline constexpr char16_t const* groupUUIDKey = u"GroupUUID"; ///< the group; absent if it has none

/// The two values of visibleKey. Any text but hidden counts as visible.
inline constexpr char16_t const* visible = u"1";
inline constexpr char16_t const* hidden = u"0"; ///< not shown

/// A nested node of an entry point: one pair of its extension data.
inline constexpr char16_t const* extensionType = u"Extension";
inline constexpr char16_t const* extensionNameKey = u"Name";   ///< the key of the pair
inline constexpr char16_t const* extensionValueKey = u"Value"; ///< the value of the pair

/// Type of the first step of the groups. No node is stored there.
inline constexpr char16_t const* groupsType = u"EntryPointGroups";

/// A group, by UUID.
inline constexpr char16_t const* groupType = u"EntryPointGroup";
inline constexpr char16_t const* groupNameKey = u"Name"; ///< the name that users see

/// UUID of the default group, which every project has and which has no node.
inline constexpr char16_t const* defaultGroupUUID = u"default";

} // namespace project::metadata::schema::entrypoints

/// The project path and the references to other projects, in two subtrees of one form. The location of the
/// first step is rootLocation.
namespace project::metadata::schema::references {

/// Types of the first steps. No node is stored there.
inline constexpr char16_t const* projectPathType = u"ProjectPath";
inline constexpr char16_t const* referencesType = u"References"; ///< the type for the references

/// A reference in either subtree, by UUID.
inline constexpr char16_t const* referenceType = u"Reference";
inline constexpr char16_t const* storedPathKey = u"Ref"; ///< relative to the project's root, or absolute
inline constexpr char16_t const* typeKey = u"Type";      ///< relative or absolute

/// The two values of typeKey.
inline constexpr char16_t const* relative = u"Relative";
inline constexpr char16_t const* absolute = u"Absolute"; ///< the stored path is absolute

} // namespace project::metadata::schema::references
