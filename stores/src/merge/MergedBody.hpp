#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "line/AddressState.hpp"
#include "project/stores/MergeConflict.hpp"
#include "text/TextBody.hpp"

namespace project::stores {

/// An address in conflict.
struct MergeSite {
    Address address;
    std::size_t offset;        ///< the position of its lines in the merged lines
    std::size_t conflicts = 0; ///< the number of its conflicts, which are consecutive in the list
    /// With line ends. If both sides have the address, merged except for the conflicts.
    ThreeWay<std::string> lines;
    /// The states of the address; nothing if one side removed it with everything below it.
    std::optional<ThreeWay<AddressState>> states;
};

/// The merge of three bodies: the merged lines without a first and last line, and the conflicts.
struct MergedBody {
    std::string lines;
    std::vector<MergeSite> sites;
    std::vector<MergeConflict> conflicts;
};

/// Merges three bodies line by line, in one pass.
/// @param bodies canonical and gapless.
MergedBody mergeBodies(ThreeWay<TextBody> const& bodies);

/// The lines of an address in conflict. @param choices one for each of its conflicts.
std::string chosenLines(MergeSite const& site, MergeSide const* choices);

} // namespace project::stores
