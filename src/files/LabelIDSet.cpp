#include "project/files/LabelIDSet.hpp"

#include <utility>

#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/LabelIdentifier.hpp"

namespace project::management {

LabelIDSet::LabelIDSet(std::u16string categoryUUID, std::u16string labelUUID)
    : categoryUUID_(std::move(categoryUUID)), labelUUID_(std::move(labelUUID)) {
}

LabelIDSet::LabelIDSet(CategoryIdentifier const& category, LabelIdentifier const& label)
    : LabelIDSet(category.getUUID(), label.getUUID()) {
}

} // namespace project::management
