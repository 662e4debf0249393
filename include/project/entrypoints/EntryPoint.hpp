#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/core/Export.hpp"
#include "project/core/Unique.hpp"
#include "project/entrypoints/EntryPointGroup.hpp"
#include "project/entrypoints/EntryPointType.hpp"

namespace project::management {

using fl::filesystem::Path;

/// A file of the project that users start from, with a type, a name, a group and data of applications.
class PROJECT_MANAGEMENT_EXPORT EntryPoint : public Unique {
public:
    ~EntryPoint() override;

    /// Returns the name that users see.
    virtual std::u16string getName() const = 0;

    /// Returns the file, absolute.
    virtual Path getFile() const = 0;

    /// Returns the type, which says when users start from the file.
    virtual EntryPointType getType() const = 0;

    /// Returns whether user interfaces show the entry point.
    virtual bool isVisible() const = 0;

    /// Returns a copy of the group, which the caller owns; null if the entry point has no group.
    virtual std::unique_ptr<EntryPointGroup> getGroup() const = 0;

    /// Returns the value of a key of the extension data; nothing if the key is absent.
    virtual std::optional<std::u16string> getExtensionData(std::u16string const& key) const = 0;

    /// Returns the keys of the extension data, sorted by code units.
    virtual std::vector<std::u16string> getExtensionKeys() const = 0;
};

/// An entry point in its editable form. Nothing is stored until it is passed to an EntryPointManager. The
/// file cannot be changed after construction.
class PROJECT_MANAGEMENT_EXPORT EntryPointDefinition : public EntryPoint {
public:
    /// A visible entry point of type Basic in the default group. Its name is the file's name without
    /// extension. It has no UUID and no extension data.
    explicit EntryPointDefinition(Path const& file);

    /// Copies everything except the UUID, deliberately: the copy is an entry point of its own. When it is
    /// stored, it takes the UUID of its file's entry point.
    EntryPointDefinition(EntryPoint const& other);
    /// The same.
    EntryPointDefinition(EntryPointDefinition const& other);

    /// Moving keeps the UUID.
    EntryPointDefinition(EntryPointDefinition&& other) noexcept = default;
    EntryPointDefinition& operator=(EntryPointDefinition const&) = delete;
    ~EntryPointDefinition() override;

    std::u16string getUUID() const override;
    std::u16string getName() const override;
    Path getFile() const override;
    EntryPointType getType() const override;
    bool isVisible() const override;
    std::unique_ptr<EntryPointGroup> getGroup() const override;
    std::optional<std::u16string> getExtensionData(std::u16string const& key) const override;
    std::vector<std::u16string> getExtensionKeys() const override;

    /// Sets the name. Returns this object, as all setters do.
    EntryPointDefinition& setName(std::u16string const& name);
    /// Sets the type.
    EntryPointDefinition& setType(EntryPointType type);
    /// Sets the UUID, whose form is not checked.
    EntryPointDefinition& setUUID(std::u16string const& uuid);
    /// Sets whether user interfaces show the entry point.
    EntryPointDefinition& setVisible(bool visible);

    /// Sets the group to a copy of the argument. Later changes of the argument have no effect.
    EntryPointDefinition& setGroup(EntryPointGroup& group);

    /// Sets the value of a key of the extension data, which may be absent.
    EntryPointDefinition& setExtensionData(std::u16string const& key, std::u16string const& value);

    /// Removes a key of the extension data, if it is present.
    EntryPointDefinition& removeExtensionData(std::u16string const& key);

    /// Sets the UUID to a new one if it is empty.
    EntryPointDefinition& generateUUIDIfNotSpecified();

private:
    Path file_;
    std::u16string name_;
    std::u16string uuid_;
    EntryPointType type_ = EntryPointType::Basic;
    bool visible_ = true;
    std::unique_ptr<EntryPointGroup> group_;
    std::map<std::u16string, std::u16string> extensionData_;
};

} // namespace project::management
