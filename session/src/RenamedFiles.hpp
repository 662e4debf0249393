#pragma once

#include <vector>

#include "project/git/GitAdapter.hpp"
#include "project/session/Move.hpp"
#include "project/session/Sync.hpp"

namespace project::session {

/// The files that a plan removes under one path and adds under another one, as SyncPlan::renamed describes.
/// Reads the new files only if a file is gone of which git has the content.
std::vector<Move> renamedFiles(SyncPlan const& plan, git::GitAdapter& git);

} // namespace project::session
