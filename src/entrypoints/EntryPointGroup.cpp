#include "project/entrypoints/EntryPointGroup.hpp"

#include "project/metadata/MetadataFunctions.hpp"

namespace project::management {

EntryPointGroup::~EntryPointGroup() = default;

EntryPointGroupDefinition::EntryPointGroupDefinition(std::u16string const& name) : name_(name) {
}

EntryPointGroupDefinition::EntryPointGroupDefinition(std::u16string const& name, std::u16string const& uuid)
    : name_(name), uuid_(uuid) {
}

EntryPointGroupDefinition::EntryPointGroupDefinition(EntryPointGroup const& group)
    : name_(group.getName()), uuid_(group.getUUID()) {
}

std::u16string EntryPointGroupDefinition::getName() const {
    return name_;
}

std::u16string EntryPointGroupDefinition::getUUID() const {
    return uuid_;
}

void EntryPointGroupDefinition::generateUUIDIfNotSet() {
    if (uuid_.empty()) {
        uuid_ = metadata::generateUUID();
    }
}

} // namespace project::management
