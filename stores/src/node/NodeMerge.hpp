#pragma once

#include <functional>

#include "node/Standing.hpp"
#include "project/stores/MergeConflict.hpp"

namespace project::stores {

/// Asked for each conflict: whose version stands. The conflicts and their order do not depend on the answers.
using Decide = std::function<MergeSide(MergeConflict&&)>;

/// Merges what stands at one address. Each side must have changed it, and not both to the same.
/// @return what stands there then, perhaps nothing.
Standing mergeStandings(Address const& address, ThreeWay<Standing> const& standings, Decide const& decide);

} // namespace project::stores
