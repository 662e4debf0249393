#include "node/Siblings.hpp"

#include <map>
#include <string>
#include <utility>

#include "node/NestedIdentity.hpp"

namespace project::stores {

using metadata::MetadataNode;

namespace {

/// The identity, and how many of the same come before.
using Place = std::pair<std::string, std::size_t>;

struct Placed {
    Place place;
    MetadataNode const* node;
};

std::vector<Placed> placed(MetadataNode const* parent) {
    std::vector<Placed> nodes;
    if (parent == nullptr) {
        return nodes;
    }
    std::map<std::string, std::size_t> counts;
    nodes.reserve(parent->getChildren().size());
    for (auto const& child : parent->getChildren()) {
        std::string identity = identityOf(*child);
        std::size_t const earlier = counts[identity]++;
        nodes.push_back({{std::move(identity), earlier}, child.get()});
    }
    return nodes;
}

} // namespace

Siblings::Siblings(Versions const& parents) {
    ThreeWay<std::vector<Placed>> const nodes{placed(parents.base), placed(parents.ours),
                                              placed(parents.theirs)};
    std::map<Place, std::size_t> ranks;
    for (auto const* const version : {&nodes.base, &nodes.ours, &nodes.theirs}) {
        for (Placed const& one : *version) {
            ranks.emplace(one.place, 0);
        }
    }
    earlier_.reserve(ranks.size());
    for (auto& [place, rank] : ranks) {
        rank = earlier_.size();
        earlier_.push_back(place.second);
    }
    byRank_.resize(ranks.size());
    auto const enter = [&](std::vector<Placed> const& version, MetadataNode const* Versions::*which,
                           Ranks& order) {
        order.reserve(version.size());
        for (Placed const& one : version) {
            order.push_back(ranks.at(one.place));
            byRank_[order.back()].*which = one.node;
        }
    };
    enter(nodes.base, &Versions::base, order_.base);
    enter(nodes.ours, &Versions::ours, order_.ours);
    enter(nodes.theirs, &Versions::theirs, order_.theirs);
}

} // namespace project::stores
