#pragma once

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Finds the parts of a project's definition that refer to something that does not exist, or that contradict
/// each other. Reads only the files that the project lists, not the whole store.
/// @param shown for the paths in findings.
Findings findProblems(OpenProject& project, ShownPaths shown);

} // namespace projectctl
