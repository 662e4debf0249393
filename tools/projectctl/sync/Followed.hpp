#pragma once

#include <vector>

#include "project/OpenProject.hpp"

namespace projectctl {

/// Lets the project follow the renamed files of which a synchronisation would otherwise remove the old path
/// or add the new one, so that they keep their labels and entry points. Guesses by the name alone, and
/// ambiguous renames, are left out. Call it in a transaction.
/// @return the moves.
std::vector<project::session::Move> followRenames(OpenProject& project,
                                                  project::session::SyncPlan const& plan);

} // namespace projectctl
