#include "project/labels/LabelDataValidators.hpp"

#include <algorithm>

namespace project::management {

LabelDataValidator::~LabelDataValidator() = default;

bool EmptyDataValidator::isValid(std::u16string const& /*text*/) const {
    // Also for the empty text: clients read this answer as "labels of this category carry no data at all".
    return false;
}

std::u16string EmptyDataValidator::getDataType() const {
    return u"None";
}

std::u16string EmptyDataValidator::getDataClass() const {
    return u"none";
}

bool StringDataValidator::isValid(std::u16string const& /*text*/) const {
    return true;
}

std::u16string StringDataValidator::getDataType() const {
    return u"String";
}

std::u16string StringDataValidator::getDataClass() const {
    // Not "string": values of this type are of class char, and clients find the validator by either name.
    return u"char";
}

bool LogicalDataValidator::isValid(std::u16string const& text) const {
    return text == u"true" || text == u"false";
}

std::u16string LogicalDataValidator::getDataType() const {
    return u"Logical";
}

std::u16string LogicalDataValidator::getDataClass() const {
    return u"logical";
}

LabelDataValidators::LabelDataValidators()
    : validators_{std::make_shared<EmptyDataValidator>(), std::make_shared<StringDataValidator>(),
                  std::make_shared<LogicalDataValidator>()} {
}

std::shared_ptr<LabelDataValidator>
LabelDataValidators::getValidator(std::function<bool(LabelDataValidator&)> predicate) const {
    auto const found = std::find_if(validators_.begin(), validators_.end(),
                                    [&](auto const& validator) { return predicate(*validator); });
    return found == validators_.end() ? nullptr : *found;
}

} // namespace project::management
