#pragma once

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// What the definition of a project says and nobody can follow, because what it refers to is gone or what it
/// says twice is allowed once. Looks at what the project lists, not at the whole store.
/// @param shown for the paths in findings.
Findings findProblems(OpenProject& project, ShownPaths shown);

} // namespace projectctl
