#pragma once

#include <string>

#include "project/core/Export.hpp"
#include "project/core/Unique.hpp"
#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/LabelIdentifier.hpp"

namespace project::management {

/// A label together with its category, as callers put it on files and events report it.
class PROJECT_MANAGEMENT_EXPORT Label : public Unique {
public:
    /// A label of a category. Whether the category contains it is not checked.
    Label(CategoryIdentifier category, LabelIdentifier labelIdentifier);

    /// Returns the label's UUID, not that of its category.
    std::u16string getUUID() const override;

    /// Returns the category.
    CategoryIdentifier const& getCategory() const { return category_; }

    /// Returns the label without its category.
    LabelIdentifier const& getLabelIdentifier() const { return labelIdentifier_; }

private:
    LabelIdentifier labelIdentifier_;
    CategoryIdentifier category_;
};

} // namespace project::management
