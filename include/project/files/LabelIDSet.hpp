#pragma once

#include <string>

#include "project/core/Export.hpp"

namespace project::management {

class CategoryIdentifier;
class LabelIdentifier;

/// A label by UUID alone: the UUID of its category and its own. The label may have been deleted.
class PROJECT_MANAGEMENT_EXPORT LabelIDSet {
public:
    LabelIDSet(std::u16string categoryUUID, std::u16string labelUUID);
    LabelIDSet(CategoryIdentifier const& category, LabelIdentifier const& label);

    std::u16string const& getCategoryUUID() const { return categoryUUID_; }

    std::u16string const& getLabelUUID() const { return labelUUID_; }

    /// Compares the categories' UUIDs and the labels' UUIDs, by code units.
    friend bool operator==(LabelIDSet const& left, LabelIDSet const& right) = default;

private:
    std::u16string categoryUUID_;
    std::u16string labelUUID_;
};

} // namespace project::management
