#pragma once

#include <string>

#include "project/core/Export.hpp"

namespace project::management {

class CategoryIdentifier;
class LabelIdentifier;

/// A label by UUID alone: the UUID of its category and its own. The label may have been deleted.
class PROJECT_MANAGEMENT_EXPORT LabelIDSet {
public:
    /// The two UUIDs, whose form is not checked.
    LabelIDSet(std::u16string categoryUUID, std::u16string labelUUID);
    /// The UUIDs of a category and of a label in it.
    LabelIDSet(CategoryIdentifier const& category, LabelIdentifier const& label);

    /// Returns the UUID of the category.
    std::u16string const& getCategoryUUID() const { return categoryUUID_; }

    /// Returns the UUID of the label.
    std::u16string const& getLabelUUID() const { return labelUUID_; }

    /// Compares the categories' UUIDs and the labels' UUIDs, by code units.
    friend bool operator==(LabelIDSet const& left, LabelIDSet const& right) = default;

private:
    std::u16string categoryUUID_;
    std::u16string labelUUID_;
};

} // namespace project::management
