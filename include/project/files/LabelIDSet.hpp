#pragma once

#include <string>

#include "project/core/Export.hpp"

namespace project::management {

class CategoryIdentifier;
class LabelIdentifier;

/// A label by UUID alone: its category's UUID and its own. It names a label also when that has been deleted.
class PROJECT_MANAGEMENT_EXPORT LabelIDSet {
public:
    LabelIDSet(std::u16string categoryUUID, std::u16string labelUUID);
    LabelIDSet(CategoryIdentifier const& category, LabelIdentifier const& label);

    std::u16string const& getCategoryUUID() const { return categoryUUID_; }

    std::u16string const& getLabelUUID() const { return labelUUID_; }

    /// By code units, the category's UUID with the category's and the label's with the label's.
    friend bool operator==(LabelIDSet const& left, LabelIDSet const& right) = default;

private:
    std::u16string categoryUUID_;
    std::u16string labelUUID_;
};

} // namespace project::management
