#include "entrypoints/EntryPointBase.hpp"

#include <utility>

namespace project::management {

EntryPointBase::EntryPointBase(Path file, EntryPointType type, std::u16string name, std::u16string uuid,
                               bool visible, std::unique_ptr<EntryPointGroup> group,
                               std::map<std::u16string, std::u16string> extensionData)
    : file_(std::move(file)),
      type_(type),
      name_(std::move(name)),
      uuid_(std::move(uuid)),
      visible_(visible),
      group_(std::move(group)),
      extensionData_(std::move(extensionData)) {
}

std::u16string EntryPointBase::getUUID() const {
    return uuid_;
}

std::u16string EntryPointBase::getName() const {
    return name_;
}

Path EntryPointBase::getFile() const {
    return file_;
}

EntryPointType EntryPointBase::getType() const {
    return type_;
}

bool EntryPointBase::isVisible() const {
    return visible_;
}

std::unique_ptr<EntryPointGroup> EntryPointBase::getGroup() const {
    return group_ ? std::make_unique<EntryPointGroupDefinition>(*group_) : nullptr;
}

std::optional<std::u16string> EntryPointBase::getExtensionData(std::u16string const& key) const {
    auto const found = extensionData_.find(key);
    return found == extensionData_.end() ? std::nullopt : std::optional(found->second);
}

std::vector<std::u16string> EntryPointBase::getExtensionKeys() const {
    std::vector<std::u16string> result;
    result.reserve(extensionData_.size());
    for (auto const& [key, value] : extensionData_) {
        result.push_back(key);
    }
    return result;
}

} // namespace project::management
