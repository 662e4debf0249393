#pragma once

#include "cli/ShownPaths.hpp"
#include "renames/Renames.hpp"

namespace projectctl {

/// Writes a line for each pair, "ren  OLD -> NEW" with the similarity of its contents, and one for each group
/// of ambiguous files.
void writeRenameLines(Renames const& renames, ShownPaths shown);

/// Writes a JSON object for each pair with "from", "to", "kind", "evidence" and "similarity", and for each
/// group of ambiguous files with the lists "from" and "to" and the evidence "ambiguous".
void writeRenameRows(Renames const& renames);

} // namespace projectctl
