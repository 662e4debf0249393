#pragma once

#include <vector>

#include "project/OpenProject.hpp"
#include "renames/Renames.hpp"

namespace projectctl {

/// Finds the files of the project that files with hidden personal labels have become in commits, for example
/// in those of another person that were merged: follows the renames of the commits that deleted the old
/// paths. Files of the project that have personal labels of their own are left out. Nothing outside a
/// repository.
/// @param similarity from which git takes two files for one, from 1 to 100.
std::vector<Rename> findPersonalRenames(OpenProject& project, int similarity);

} // namespace projectctl
