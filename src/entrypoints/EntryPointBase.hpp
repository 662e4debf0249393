#pragma once

#include "project/entrypoints/EntryPoint.hpp"

namespace project::management {

/// An entry point that was read from the store. It cannot be edited; an EntryPointDefinition copied from it
/// can.
class EntryPointBase : public EntryPoint {
public:
    /// @param file absolute.
    /// @param group null for an entry point without a group.
    EntryPointBase(Path file, EntryPointType type, std::u16string name, std::u16string uuid, bool visible,
                   std::unique_ptr<EntryPointGroup> group,
                   std::map<std::u16string, std::u16string> extensionData);

    std::u16string getUUID() const override;
    std::u16string getName() const override;
    Path getFile() const override;
    EntryPointType getType() const override;
    bool isVisible() const override;
    std::unique_ptr<EntryPointGroup> getGroup() const override;
    std::optional<std::u16string> getExtensionData(std::u16string const& key) const override;
    std::vector<std::u16string> getExtensionKeys() const override;

private:
    Path file_;
    EntryPointType type_;
    std::u16string name_;
    std::u16string uuid_;
    bool visible_;
    std::unique_ptr<EntryPointGroup> group_;
    std::map<std::u16string, std::u16string> extensionData_;
};

} // namespace project::management
