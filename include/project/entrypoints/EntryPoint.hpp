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

/// The role of one project file in the project's life: what starts with it, ends with it or runs on demand.
class PROJECT_MANAGEMENT_EXPORT EntryPoint : public Unique {
public:
    ~EntryPoint() override;

    /// The name that is shown to people.
    virtual std::u16string getName() const = 0;

    /// The file, absolute.
    virtual Path getFile() const = 0;

    virtual EntryPointType getType() const = 0;

    virtual bool isVisible() const = 0;

    /// A copy of the group, which the caller owns; null when the entry point has none.
    virtual std::unique_ptr<EntryPointGroup> getGroup() const = 0;

    /// The value that somebody has put under this key; empty when the key is absent.
    virtual std::optional<std::u16string> getExtensionData(std::u16string const& key) const = 0;

    /// The keys of the extension data, sorted by code units.
    virtual std::vector<std::u16string> getExtensionKeys() const = 0;
};

/// An entry point as a caller builds and edits it. Plain data: nothing is stored until it is given to an
/// EntryPointManager. The file is fixed at construction.
class PROJECT_MANAGEMENT_EXPORT EntryPointDefinition : public EntryPoint {
public:
    /// A visible entry point of type Basic in the default group, named after the file without its extension.
    /// It has no UUID and no extension data.
    explicit EntryPointDefinition(Path const& file);

    /// A copy of everything but the UUID, which stays empty: the copy is an entry point of its own until it
    /// is stored, where it takes over the UUID of its file's entry.
    EntryPointDefinition(EntryPoint const& other);
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

    EntryPointDefinition& setName(std::u16string const& name);
    EntryPointDefinition& setType(EntryPointType type);
    EntryPointDefinition& setUUID(std::u16string const& uuid);
    EntryPointDefinition& setVisible(bool visible);

    /// Puts the entry point into a copy of this group: later changes of the argument don't show here.
    EntryPointDefinition& setGroup(EntryPointGroup& group);

    /// Adds the key, or replaces its value.
    EntryPointDefinition& setExtensionData(std::u16string const& key, std::u16string const& value);

    /// Removes the key; an absent one is no error.
    EntryPointDefinition& removeExtensionData(std::u16string const& key);

    /// Gives the entry point a fresh UUID, unless it has one.
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
