#pragma once

/// What the subtree of a project's categories and labels is made of.
namespace project::management::labels {

/// Type and location of the head. No node stands there.
inline constexpr char16_t const* CATEGORIES = u"Categories";
inline constexpr char16_t const* CATEGORIES_LOCATION = u"Root";

/// Types of the elements below it. Their locations are the UUIDs.
inline constexpr char16_t const* CATEGORY = u"Category";
inline constexpr char16_t const* LABEL = u"Label";

/// Type of a category's node and of a label's.
inline constexpr char16_t const* NODE = u"Info";

/// Keys of a category. The first two hold a flag.
inline constexpr char16_t const* CATEGORY_READ_ONLY = u"ReadOnly";
inline constexpr char16_t const* CATEGORY_SINGLE_VALUED = u"SingleValued";
inline constexpr char16_t const* CATEGORY_NAME = u"Name";
inline constexpr char16_t const* CATEGORY_DATA_TYPE = u"DataType";

/// Keys of a label. The second holds the text of a LabelReadOnlyState, no flag.
inline constexpr char16_t const* LABEL_NAME = u"Name";
inline constexpr char16_t const* LABEL_READ_ONLY = u"ReadOnly";

/// The two texts of a flag. Any other text counts as FLAG_FALSE.
inline constexpr char16_t const* FLAG_TRUE = u"1";
inline constexpr char16_t const* FLAG_FALSE = u"0";

} // namespace project::management::labels
