#pragma once

#include <functional>

#include "line/AddressState.hpp"
#include "project/stores/MergeConflict.hpp"

namespace project::stores {

/// Called for each conflict; returns the side whose version wins. The conflicts and their order do not depend
/// on the results.
using Decide = std::function<MergeSide(MergeConflict&&)>;

/// Merges the states of one address that both sides changed, not alike.
/// @return the merged state, possibly neither a node nor created.
AddressState mergeStates(Address const& address, ThreeWay<AddressState> const& states, Decide const& decide);

/// True if a state contains nothing that the earlier state does not contain: keys and nested nodes were only
/// removed or moved, or the node was removed. Such a change does not conflict with the removal of the
/// address.
bool isReductionOf(AddressState const& state, AddressState const& earlier);

} // namespace project::stores
