#pragma once

#include "project/OpenProject.hpp"

namespace projectctl {

/// Writes the rules of a project to standard output, one per line: the folder, and the options of `sync
/// --rule` that set it, as words of a shell.
void writeRules(OpenProject& project);

/// Writes them as a JSON document.
void writeRulesAsJson(OpenProject& project);

} // namespace projectctl
