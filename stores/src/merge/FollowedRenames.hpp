#pragma once

#include "project/stores/PathMoves.hpp"
#include "project/stores/TextMerge.hpp"
#include "text/TextBody.hpp"

namespace project::stores {

/// The moves that give each file of three versions the path that it has after the merge.
///
/// A rename is followed if the side's text has renamed the file, too, and the other side's text still has it.
/// It is not followed where the two sides renamed a file differently, or where two files of a version would
/// meet at one path: there, the merge goes on as if nothing had been renamed. A folder is renamed if the side
/// has left it and most of its renamed files agree on the new place.
///
/// @param bodies canonical and gapless. @param ours the renames of ours. @param theirs those of theirs.
ThreeWay<PathMoves> followedRenames(ThreeWay<TextBody> const& bodies, SideRenames const& ours,
                                    SideRenames const& theirs);

} // namespace project::stores
