#include "project/entrypoints/EntryPoint.hpp"

#include "entrypoints/EntryPointGroupBase.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace project::management {

EntryPoint::~EntryPoint() = default;

EntryPointDefinition::EntryPointDefinition(Path const& file)
    : file_(file), name_(fl::filesystem::detail::extract_stem(file.native())), group_(getDefaultGroup()) {
}

EntryPointDefinition::EntryPointDefinition(EntryPoint const& other)
    : file_(other.getFile()), name_(other.getName()), type_(other.getType()), visible_(other.isVisible()) {
    if (auto const group = other.getGroup()) {
        setGroup(*group);
    }
    for (auto const& key : other.getExtensionKeys()) {
        if (auto const value = other.getExtensionData(key)) {
            setExtensionData(key, *value);
        }
    }
}

EntryPointDefinition::EntryPointDefinition(EntryPointDefinition const& other)
    : EntryPointDefinition(static_cast<EntryPoint const&>(other)) {
}

EntryPointDefinition::~EntryPointDefinition() = default;

std::u16string EntryPointDefinition::getUUID() const {
    return uuid_;
}

std::u16string EntryPointDefinition::getName() const {
    return name_;
}

Path EntryPointDefinition::getFile() const {
    return file_;
}

EntryPointType EntryPointDefinition::getType() const {
    return type_;
}

bool EntryPointDefinition::isVisible() const {
    return visible_;
}

std::unique_ptr<EntryPointGroup> EntryPointDefinition::getGroup() const {
    return group_ ? std::make_unique<EntryPointGroupDefinition>(*group_) : nullptr;
}

std::optional<std::u16string> EntryPointDefinition::getExtensionData(std::u16string const& key) const {
    auto const found = extensionData_.find(key);
    return found == extensionData_.end() ? std::nullopt : std::optional(found->second);
}

std::vector<std::u16string> EntryPointDefinition::getExtensionKeys() const {
    std::vector<std::u16string> result;
    result.reserve(extensionData_.size());
    for (auto const& [key, value] : extensionData_) {
        result.push_back(key);
    }
    return result;
}

EntryPointDefinition& EntryPointDefinition::setName(std::u16string const& name) {
    name_ = name;
    return *this;
}

EntryPointDefinition& EntryPointDefinition::setType(EntryPointType type) {
    type_ = type;
    return *this;
}

EntryPointDefinition& EntryPointDefinition::setUUID(std::u16string const& uuid) {
    uuid_ = uuid;
    return *this;
}

EntryPointDefinition& EntryPointDefinition::setVisible(bool visible) {
    visible_ = visible;
    return *this;
}

EntryPointDefinition& EntryPointDefinition::setGroup(EntryPointGroup& group) {
    group_ = std::make_unique<EntryPointGroupDefinition>(group);
    return *this;
}

EntryPointDefinition& EntryPointDefinition::setExtensionData(std::u16string const& key,
                                                             std::u16string const& value) {
    extensionData_[key] = value;
    return *this;
}

EntryPointDefinition& EntryPointDefinition::removeExtensionData(std::u16string const& key) {
    extensionData_.erase(key);
    return *this;
}

EntryPointDefinition& EntryPointDefinition::generateUUIDIfNotSpecified() {
    if (uuid_.empty()) {
        uuid_ = metadata::generateUUID();
    }
    return *this;
}

} // namespace project::management
