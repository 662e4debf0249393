#pragma once

#include "project/OpenProject.hpp"
#include "renames/Renames.hpp"

namespace projectctl {

using project::session::usualSimilarity;

/// Pairs the files of the project that are missing on disk with files that are not in the project, as
/// project::session::Session::findRenames does, unless the user has turned source control off: then by their
/// names. Hidden personal labels are paired as findPersonalRenames does.
/// @param similarity from 1 to 100.
/// @throws Failure if git fails.
Renames findRenames(OpenProject& project, int similarity = usualSimilarity);

} // namespace projectctl
