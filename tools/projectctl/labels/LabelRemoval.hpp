#pragma once

#include <functional>

#include "project/LabelLayer.hpp"
#include "project/OpenProject.hpp"
#include "project/session/Query.hpp"

namespace projectctl {

/// Runs a change of the labels of a layer as one step, together with the search for their names.
void changeLabels(OpenProject& project, LabelLayer const& layer, std::function<void()> const& change);

/// Counts the files that lose a label, or any label of a category, and notes how to undo that. Call it before
/// the change, in its step. Does nothing for personal labels, which git does not have.
void noteRemoval(OpenProject& project, LabelLayer const& layer, project::session::LabelChoice const& labels);

} // namespace projectctl
