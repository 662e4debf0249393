#pragma once

#include <vector>

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/OpenProject.hpp"
#include "project/stores/Fault.hpp"

namespace projectctl {

/// The faults of the project's text, or of its log. Call it without an open guard.
std::vector<project::stores::Fault> faultsOfDefinition(OpenProject& project);

/// Everything that `check` reports: the faults of the definition, of its tree and of the personal text,
/// folders that are not up to date, and the set-up of git. The worst first. Call it without an open guard.
/// @param shown for the paths in findings.
Findings findingsOf(std::vector<project::stores::Fault> const& faults, OpenProject& project,
                    ShownPaths const& shown);

} // namespace projectctl
