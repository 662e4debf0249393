#pragma once

#include "project/OpenProject.hpp"
#include "project/session/Query.hpp"

namespace projectctl {

/// Counts the files that lose a label, or any label of a category, and notes how to undo that. Call it before
/// the change, in its transaction.
void noteRemoval(OpenProject& project, project::session::LabelChoice const& labels);

} // namespace projectctl
