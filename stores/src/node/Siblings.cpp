#include "node/Siblings.hpp"

#include <algorithm>
#include <iterator>
#include <map>
#include <string>
#include <utility>

#include "node/NestedNodes.hpp"

namespace project::stores {

using metadata::MetadataNode;
using Ranks = Siblings::Ranks;

namespace {

/// The identity, and the number of preceding siblings that have the same identity.
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

/// A set of ranks: true at each rank in it.
using Set = std::vector<bool>;

Set setOf(Ranks const& ranks, std::size_t size) {
    Set set(size, false);
    for (std::size_t const rank : ranks) {
        set[rank] = true;
    }
    return set;
}

Set intersection(Set left, Set const& right) {
    for (std::size_t rank = 0; rank < left.size(); ++rank) {
        left[rank] = left[rank] && right[rank];
    }
    return left;
}

Ranks only(Set const& wanted, Ranks const& ranks) {
    Ranks result;
    std::copy_if(ranks.begin(), ranks.end(), std::back_inserter(result),
                 [&](std::size_t rank) { return wanted[rank]; });
    return result;
}

/// The kept ranks that only one side has, as runs. Run 0 precedes all common ranks; run r + 1 follows the
/// common rank r.
std::vector<Ranks> runs(Ranks const& side, Set const& common, Set const& isKept) {
    std::vector<Ranks> result(common.size() + 1);
    std::size_t run = 0;
    for (std::size_t const rank : side) {
        if (common[rank]) {
            run = rank + 1;
        } else if (isKept[rank]) {
            result[run].push_back(rank);
        }
    }
    return result;
}

Ranks commonOrder(ThreeWay<Ranks> const& order, Set const& common) {
    Ranks ours = only(common, order.ours);
    Ranks theirs = only(common, order.theirs);
    Set const old = intersection(common, setOf(order.base, common.size()));
    Ranks const before = only(old, order.base);
    bool const hasOursMoved = only(old, ours) != before;
    bool const hasTheirsMoved = only(old, theirs) != before;
    if (hasOursMoved == hasTheirsMoved) {
        return std::min(ours, theirs);
    }
    return hasOursMoved ? ours : theirs;
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

Ranks Siblings::mergedOrder(std::vector<bool> const& isKept) const {
    Set const both = intersection(setOf(order_.ours, isKept.size()), setOf(order_.theirs, isKept.size()));
    Set const common = intersection(both, isKept);
    std::vector<Ranks> const ours = runs(order_.ours, common, isKept);
    std::vector<Ranks> const theirs = runs(order_.theirs, common, isKept);
    Ranks result;
    auto const addRuns = [&](std::size_t run) {
        auto const [first, second] = std::minmax(ours[run], theirs[run]);
        result.insert(result.end(), first.begin(), first.end());
        result.insert(result.end(), second.begin(), second.end());
    };
    addRuns(0);
    for (std::size_t const rank : commonOrder(order_, common)) {
        result.push_back(rank);
        addRuns(rank + 1);
    }
    return result;
}

} // namespace project::stores
