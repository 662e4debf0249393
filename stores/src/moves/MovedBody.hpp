#pragma once

#include "project/stores/PathMoves.hpp"
#include "text/TextBody.hpp"

namespace project::stores {

/// A body after moves: each line at its new address and with its new paths. Lines that meet at one address
/// are joined, as two folders are whose contents come together.
///
/// A folder that moves stays in the file list, without what was attached to it, if something remains below
/// it; and the folders above a new place are added to the list.
/// @param body canonical and gapless, as the result is.
TextBody movedBody(TextBody body, PathMoves const& moves);

} // namespace project::stores
