#pragma once

#include <string>
#include <vector>

#include "project/OpenProject.hpp"
#include "renames/Renames.hpp"

namespace projectctl {

/// The similarity from which two files are a pair, unless the user chooses another one, in percent.
constexpr int usualSimilarity = 50;

/// Pairs the files of the project that are missing on disk with files that are not in the project.
///
/// In a repository, the contents decide: those of the last commit that wrote the project's text, so that
/// renames that were committed since are found; otherwise the staged ones, otherwise those of the last commit
/// that contained the file. Files that git ignores are left out. A file without any earlier content is paired
/// by its name, as are all files outside a repository. Hidden personal labels are paired as
/// findPersonalRenames does.
/// @param similarity from 1 to 100.
/// @throws Failure if git fails.
Renames findRenames(OpenProject& project, int similarity = usualSimilarity);

} // namespace projectctl
