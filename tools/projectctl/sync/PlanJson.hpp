#pragma once

#include "project/OpenProject.hpp"

namespace projectctl {

/// Writes the changes of a synchronisation to standard output, as a JSON document.
/// @param isApplied whether they were made.
void writeAsJson(project::session::SyncPlan const& plan, bool isApplied, OpenProject& project);

} // namespace projectctl
