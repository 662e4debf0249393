#include "node/NestedOrder.hpp"

#include <algorithm>
#include <iterator>

namespace project::stores {

namespace {

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

/// What one side alone has, by what it follows: first what nothing of both sides comes before, then by the
/// rank of that.
std::vector<Ranks> runs(Ranks const& side, Set const& common, Set const& stays) {
    std::vector<Ranks> result(common.size() + 1);
    std::size_t follows = 0;
    for (std::size_t const rank : side) {
        if (common[rank]) {
            follows = rank + 1;
        } else if (stays[rank]) {
            result[follows].push_back(rank);
        }
    }
    return result;
}

Ranks commonOrder(ThreeWay<Ranks> const& order, Set const& common) {
    Ranks ours = only(common, order.ours);
    Ranks theirs = only(common, order.theirs);
    Set const old = intersection(common, setOf(order.base, common.size()));
    Ranks const before = only(old, order.base);
    bool const oursMoved = only(old, ours) != before;
    bool const theirsMoved = only(old, theirs) != before;
    if (oursMoved == theirsMoved) {
        return std::min(ours, theirs);
    }
    return oursMoved ? ours : theirs;
}

} // namespace

Ranks mergedOrder(ThreeWay<Ranks> const& order, std::vector<bool> const& stays) {
    Set const both = intersection(setOf(order.ours, stays.size()), setOf(order.theirs, stays.size()));
    Set const common = intersection(both, stays);
    std::vector<Ranks> const ours = runs(order.ours, common, stays);
    std::vector<Ranks> const theirs = runs(order.theirs, common, stays);
    Ranks result;
    auto const addRuns = [&](std::size_t follows) {
        auto const [first, second] = std::minmax(ours[follows], theirs[follows]);
        result.insert(result.end(), first.begin(), first.end());
        result.insert(result.end(), second.begin(), second.end());
    };
    addRuns(0);
    for (std::size_t const rank : commonOrder(order, common)) {
        result.push_back(rank);
        addRuns(rank + 1);
    }
    return result;
}

} // namespace project::stores
