#include "project/labels/LabelIdentifier.hpp"

#include <utility>

#include "project/metadata/MetadataFunctions.hpp"

namespace project::management {

LabelIdentifier::LabelIdentifier(std::u16string uuid, std::u16string name, LabelReadOnlyState state)
    : uuid_(std::move(uuid)), name_(std::move(name)), readOnlyState_(state) {
}

std::u16string LabelIdentifier::getUUID() const {
    return uuid_;
}

std::u16string LabelIdentifier::getName() const {
    return name_;
}

LabelReadOnlyState LabelIdentifier::isReadOnly() const {
    return readOnlyState_;
}

bool LabelIdentifier::operator==(LabelIdentifier const& other) const {
    return name_ == other.name_ && uuid_ == other.uuid_ && readOnlyState_ == other.readOnlyState_;
}

bool LabelIdentifier::operator!=(LabelIdentifier const& other) const {
    return !(*this == other);
}

LabelDefinition::LabelDefinition(std::u16string const& name)
    : LabelDefinition(name, metadata::generateUUID()) {
}

LabelDefinition::LabelDefinition(std::u16string const& name, std::u16string const& uuid)
    : LabelIdentifier(uuid, name, LabelReadOnlyState::INHERITED) {
}

LabelDefinition& LabelDefinition::setIsReadOnly(LabelReadOnlyState state) {
    readOnlyState_ = state;
    return *this;
}

} // namespace project::management
