#include "entrypoints/Groups.hpp"

#include "cli/Choice.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

using project::management::EntryPointGroup;

Groups::Groups(project::management::EntryPointManager& entryPoints)
    : groups_(entryPoints.getEntryPointGroups()) {
}

EntryPointGroup& Groups::named(std::string const& name) const {
    std::vector<Named> names;
    names.reserve(groups_.size());
    for (auto const& group : groups_) {
        names.push_back({group->getName(), group->getUUID()});
    }
    std::u16string const wanted = textOf(name);
    auto const chosen = choose(names, wanted, "entry point groups");
    if (!chosen) {
        throw Failure("there is no entry point group " + inQuotes(wanted) +
                      ". 'projectctl group list' shows the groups");
    }
    return *groups_[*chosen];
}

} // namespace projectctl
