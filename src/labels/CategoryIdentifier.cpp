#include "project/labels/CategoryIdentifier.hpp"

#include <utility>

#include "project/labels/LabelDataValidators.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace project::management {

CategoryIdentifier::CategoryIdentifier(std::u16string uuid, std::u16string name, bool readOnly,
                                       bool singleValued, std::u16string dataType)
    : uuid_(std::move(uuid)),
      name_(std::move(name)),
      dataType_(std::move(dataType)),
      readOnly_(readOnly),
      singleValued_(singleValued) {
}

std::u16string CategoryIdentifier::getUUID() const {
    return uuid_;
}

std::u16string CategoryIdentifier::getName() const {
    return name_;
}

bool CategoryIdentifier::isReadOnly() const {
    return readOnly_;
}

bool CategoryIdentifier::isSingleValued() const {
    return singleValued_;
}

std::u16string CategoryIdentifier::getDataType() const {
    return dataType_.empty() ? EmptyDataValidator().getDataType() : dataType_;
}

CategoryDefinition::CategoryDefinition(std::u16string const& name)
    : CategoryDefinition(name, metadata::generateUUID()) {
}

CategoryDefinition::CategoryDefinition(std::u16string const& name, std::u16string const& uuid)
    : CategoryIdentifier(uuid, name, false, false, EmptyDataValidator().getDataType()) {
}

CategoryDefinition& CategoryDefinition::setIsReadOnly(bool readOnly) {
    readOnly_ = readOnly;
    return *this;
}

CategoryDefinition& CategoryDefinition::setIsSingleValued(bool singleValued) {
    singleValued_ = singleValued;
    return *this;
}

CategoryDefinition& CategoryDefinition::setDataType(std::u16string dataType) {
    dataType_ = std::move(dataType);
    return *this;
}

} // namespace project::management
