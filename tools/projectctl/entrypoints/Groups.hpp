#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/core/EntryPointManager.hpp"
#include "project/entrypoints/EntryPointGroup.hpp"

namespace projectctl {

/// The entry point groups of a project, as arguments name them. The first one is the default group, which
/// every project has; when somebody has renamed it, it is listed a second time, under its new name.
class Groups {
public:
    using List = std::vector<std::unique_ptr<project::management::EntryPointGroup>>;

    /// Reads the groups. Whoever acts on them holds a guard of the store from before that until after the
    /// act.
    explicit Groups(project::management::EntryPointManager& entryPoints);

    List const& all() const noexcept { return groups_; }

    /// The group of a name or UUID. @param name bytes of an argument.
    /// @throws Failure when there is none, or when several are called so.
    project::management::EntryPointGroup& named(std::string const& name) const;

    /// Whether it is the group that cannot go, since it is stored nowhere.
    bool isDefault(project::management::EntryPointGroup const& group) const noexcept {
        return &group == groups_.front().get();
    }

private:
    List groups_;
};

} // namespace projectctl
