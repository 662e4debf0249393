#pragma once

#include <vector>

#include "output/JsonRows.hpp"
#include "project/stores/DefinitionChange.hpp"

namespace projectctl {

/// Adds changes between two versions of a definition to an array in JSON. Paths are relative to the root.
void addChanges(JsonRows& rows, std::vector<project::stores::DefinitionChange> const& changes);

} // namespace projectctl
