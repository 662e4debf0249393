#pragma once

#include <memory>
#include <string>

#include "project/entrypoints/EntryPointGroup.hpp"

namespace project::management {

/// A group as the entry point manager gives it: the default group, or one that was read from the store.
class EntryPointGroupBase : public EntryPointGroupDefinition {
public:
    EntryPointGroupBase(std::u16string const& name, std::u16string const& uuid);
};

/// The group of all entry points that name no other. Its UUID is "default"; its name is the catalog's text in
/// the global locale of the first call in this process, whatever locale is set later: names are compared with
/// it, so it must not change while projects are open.
std::unique_ptr<EntryPointGroup> getDefaultGroup();

} // namespace project::management
