#pragma once

#include <memory>
#include <string>

#include "project/entrypoints/EntryPointGroup.hpp"

namespace project::management {

/// A group that the entry point manager returns: the default group, or one that was read from the store.
class EntryPointGroupBase : public EntryPointGroupDefinition {
public:
    EntryPointGroupBase(std::u16string const& name, std::u16string const& uuid);
};

/// Returns the group of all entry points without a stored group. Its UUID is "default". Its name is the
/// catalog's text in the global locale at the first call in this process, even if the locale is changed
/// later: group names are compared with it, so it must not change while projects are open.
std::unique_ptr<EntryPointGroup> getDefaultGroup();

} // namespace project::management
