#pragma once

#include "checks/Finding.hpp"
#include "fl/filesystem/Path.hpp"

namespace projectctl {

/// Reports a repository that does not merge the project's text with this tool. Nothing where the user has
/// asked to leave git alone.
/// @param root the project's root.
void checkMergeSetup(fl::filesystem::Path const& root, Findings& findings);

} // namespace projectctl
