#pragma once

#include <string>

#include "project/core/Export.hpp"

namespace project::management {

/// A named group that entry points stand in.
class PROJECT_MANAGEMENT_EXPORT EntryPointGroup {
public:
    virtual ~EntryPointGroup();

    virtual std::u16string getName() const = 0;

    /// What the group is known by, whatever its name. Empty for one that was never stored and was not given
    /// any.
    virtual std::u16string getUUID() const = 0;
};

/// A group as a caller builds it. Plain data: nothing is stored until it is given to an EntryPointManager.
class PROJECT_MANAGEMENT_EXPORT EntryPointGroupDefinition : public EntryPointGroup {
public:
    /// A group without a UUID.
    explicit EntryPointGroupDefinition(std::u16string const& name);

    EntryPointGroupDefinition(std::u16string const& name, std::u16string const& uuid);

    /// A copy with name and UUID: the same group.
    EntryPointGroupDefinition(EntryPointGroup const& group);

    std::u16string getName() const override;
    std::u16string getUUID() const override;

    /// Gives the group a fresh UUID, unless it has one.
    void generateUUIDIfNotSet();

private:
    std::u16string name_;
    std::u16string uuid_;
};

} // namespace project::management
