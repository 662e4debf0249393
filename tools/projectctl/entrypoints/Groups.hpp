#pragma once

#include <memory>
#include <string>
#include <vector>

#include "cli/Choice.hpp"
#include "project/core/EntryPointManager.hpp"
#include "project/entrypoints/EntryPointGroup.hpp"

namespace projectctl {

/// The entry point groups of a project. The first one is the default group, which every project has. If it
/// was renamed, it is listed a second time, under its new name.
class Groups {
public:
    using List = std::vector<std::unique_ptr<project::management::EntryPointGroup>>;

    /// Reads the groups. A caller that changes one holds a guard of the store from before the construction
    /// until after the change.
    explicit Groups(project::management::EntryPointManager& entryPoints);

    List const& all() const noexcept { return groups_; }

    /// Their names and UUIDs, in the same order.
    std::vector<Named> names() const;

    /// The group with a name or UUID. @param name bytes of an argument.
    /// @throws Failure if there is none, or if several groups have the name.
    project::management::EntryPointGroup& named(std::string const& name) const;

    /// Whether it is the default group, which is not stored and cannot be deleted.
    bool isDefault(project::management::EntryPointGroup const& group) const noexcept {
        return &group == groups_.front().get();
    }

private:
    List groups_;
};

} // namespace projectctl
