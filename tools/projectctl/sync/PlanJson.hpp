#pragma once

#include <vector>

#include "project/OpenProject.hpp"

namespace projectctl {

/// Writes the changes of a synchronisation to standard output, as a JSON document.
/// @param renamed the files that the project has followed. @param isApplied whether the changes were made.
void writeAsJson(project::session::SyncPlan const& plan, bool isApplied, OpenProject& project);

} // namespace projectctl
