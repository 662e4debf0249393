#pragma once

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Finds the files that are not up to date in folders that have rules: those that `projectctl sync` would add
/// or remove. Without a rule, it reads nothing from the disk.
/// @param shown for the paths in findings.
Findings findOutOfDate(OpenProject& project, ShownPaths shown);

} // namespace projectctl
