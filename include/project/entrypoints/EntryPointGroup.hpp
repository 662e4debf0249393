#pragma once

#include <string>

#include "project/core/Export.hpp"

namespace project::management {

/// A named group of entry points.
class PROJECT_MANAGEMENT_EXPORT EntryPointGroup {
public:
    virtual ~EntryPointGroup();

    /// Returns the name that users see.
    virtual std::u16string getName() const = 0;

    /// Returns the UUID, which identifies the group. It is empty for a group that was not stored yet and was
    /// constructed without one.
    virtual std::u16string getUUID() const = 0;
};

/// A group that a caller builds. Nothing is stored until it is passed to an EntryPointManager.
class PROJECT_MANAGEMENT_EXPORT EntryPointGroupDefinition : public EntryPointGroup {
public:
    /// A group without a UUID.
    explicit EntryPointGroupDefinition(std::u16string const& name);

    /// A group with a given UUID, whose form is not checked.
    EntryPointGroupDefinition(std::u16string const& name, std::u16string const& uuid);

    /// Copies the name and the UUID of a group.
    EntryPointGroupDefinition(EntryPointGroup const& group);

    std::u16string getName() const override;
    std::u16string getUUID() const override;

    /// Sets the UUID to a new one if it is empty.
    void generateUUIDIfNotSet();

private:
    std::u16string name_;
    std::u16string uuid_;
};

} // namespace project::management
