#include "entrypoints/Groups.hpp"

#include "cli/Nearest.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

using project::management::EntryPointGroup;

Groups::Groups(project::management::EntryPointManager& entryPoints)
    : groups_(entryPoints.getEntryPointGroups()) {
}

std::vector<Named> Groups::names() const {
    std::vector<Named> result;
    result.reserve(groups_.size());
    for (auto const& group : groups_) {
        result.push_back({group->getName(), group->getUUID()});
    }
    return result;
}

EntryPointGroup& Groups::named(std::string const& name) const {
    auto const known = names();
    std::u16string const wanted = textOf(name);
    auto const chosen = choose(known, wanted, "SeveralGroups");
    if (!chosen) {
        auto const meant = nearest(wanted, known);
        throw Failure(meant ? Message("GroupMeant", wanted, *meant) : Message("GroupUnknown", wanted));
    }
    return *groups_[*chosen];
}

} // namespace projectctl
