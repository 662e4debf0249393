#include "Siblings.hpp"

#include "NestedIdentity.hpp"

namespace project::stores {

using metadata::MetadataNode;

namespace {

/// The identity, and how many of the same come before.
using Place = std::pair<std::string, std::size_t>;

std::vector<Place> placesOf(MetadataNode const* parent) {
    std::vector<Place> places;
    if (parent == nullptr) {
        return places;
    }
    std::map<std::string, std::size_t> counts;
    places.reserve(parent->getChildren().size());
    for (auto const& child : parent->getChildren()) {
        std::string identity = identityOf(*child);
        std::size_t const earlier = counts[identity]++;
        places.emplace_back(std::move(identity), earlier);
    }
    return places;
}

} // namespace

Siblings::Siblings(Versions const& parents) {
    constexpr MetadataNode const* Versions::*members[] = {&Versions::base, &Versions::ours,
                                                          &Versions::theirs};
    constexpr Ranks ThreeWay<Ranks>::*orders[] = {&ThreeWay<Ranks>::base, &ThreeWay<Ranks>::ours,
                                                  &ThreeWay<Ranks>::theirs};
    std::vector<std::vector<Place>> places;
    places.reserve(std::size(members));
    std::map<Place, std::size_t> ranks;
    for (auto const member : members) {
        places.push_back(placesOf(parents.*member));
        for (Place const& place : places.back()) {
            ranks.emplace(place, 0);
        }
    }
    earlier_.reserve(ranks.size());
    for (auto& [place, rank] : ranks) {
        rank = earlier_.size();
        earlier_.push_back(place.second);
    }
    byRank_.resize(ranks.size());
    for (std::size_t version = 0; version < places.size(); ++version) {
        for (std::size_t i = 0; i < places[version].size(); ++i) {
            std::size_t const rank = ranks.at(places[version][i]);
            byRank_[rank].*members[version] = (parents.*members[version])->getChildren()[i].get();
            (order_.*orders[version]).push_back(rank);
        }
    }
}

} // namespace project::stores
