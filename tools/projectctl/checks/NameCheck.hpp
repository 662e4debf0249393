#pragma once

#include "checks/CheckedFile.hpp"
#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"

namespace projectctl {

/// Notes a file or folder whose name contains a backslash. Entry points and references store "/" instead of
/// it, so they cannot find the file again.
void checkName(CheckedFile const& subject, ShownPaths& shown, Findings& findings);

} // namespace projectctl
