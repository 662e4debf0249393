#pragma once

#include <cstddef>
#include <vector>

#include "project/stores/MergeConflict.hpp"

namespace project::stores {

/// Nested nodes by their ranks: numbers from 0 up, each node's the same in all versions, in the order of
/// their identities.
using Ranks = std::vector<std::size_t>;

/// The order of merged nested nodes, which does not change when ours and theirs are exchanged.
///
/// Those of both sides keep the order that both have; else that of the side that moved them; else, when both
/// moved them or both brought them, the order that is the smaller one by rank. Those of one side stay behind
/// the node of both sides that they follow there; of two such runs in one place the smaller one comes first.
/// @param order the ranks in each version, each at most once.
/// @param stays by rank: false for a node that is not in the merged ones.
Ranks mergedOrder(ThreeWay<Ranks> const& order, std::vector<bool> const& stays);

} // namespace project::stores
