#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "node/Standing.hpp"
#include "project/stores/MergeConflict.hpp"
#include "text/TextBody.hpp"

namespace project::stores {

/// An address at which something is left to decide.
struct MergeSite {
    Address address;
    std::size_t offset;        ///< where in the merged lines its own belong
    std::size_t conflicts = 0; ///< how many of the merge's conflicts are here; they follow each other
    ThreeWay<std::string>
        lines; ///< with their ends; for a line with ours or theirs wherever there is a conflict
    std::optional<ThreeWay<Standing>>
        standings; ///< of a line; nothing when an address went with all below it
};

/// Three bodies merged: the lines that are decided, and what is left to decide between them.
struct MergedBody {
    std::string lines;
    std::vector<MergeSite> sites;
    std::vector<MergeConflict> conflicts;
};

/// Walks through three bodies side by side, line by line.
/// @param bodies canonical and gapless.
MergedBody mergeBodies(ThreeWay<TextBody> const& bodies);

/// The lines of a site. @param choices one for each of its conflicts.
std::string chosenLines(MergeSite const& site, MergeSide const* choices);

} // namespace project::stores
