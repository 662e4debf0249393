#include "project/labels/Label.hpp"

#include <utility>

namespace project::management {

Label::Label(CategoryIdentifier category, LabelIdentifier labelIdentifier)
    : labelIdentifier_(std::move(labelIdentifier)), category_(std::move(category)) {
}

std::u16string Label::getUUID() const {
    return labelIdentifier_.getUUID();
}

} // namespace project::management
