#pragma once

#include "checks/Finding.hpp"
#include "fl/filesystem/Path.hpp"

namespace projectctl {

/// Reports a git repository that does not merge the project's text with this tool. Reports nothing if the
/// user turned source control off.
/// @param root the project's root.
void checkMergeSetup(fl::filesystem::Path const& root, Findings& findings);

} // namespace projectctl
