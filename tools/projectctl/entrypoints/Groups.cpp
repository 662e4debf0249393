#include "entrypoints/Groups.hpp"

#include <algorithm>

#include "cli/Choice.hpp"
#include "cli/Nearest.hpp"
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
        std::vector<std::u16string> known(names.size());
        std::ranges::transform(names, known.begin(), &Named::name);
        auto const meant = nearest(wanted, known);
        throw Failure(meant ? Message("GroupMeant", wanted, *meant) : Message("GroupUnknown", wanted));
    }
    return *groups_[*chosen];
}

} // namespace projectctl
