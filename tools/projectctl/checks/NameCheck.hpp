#pragma once

#include <string>

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"

namespace projectctl {

/// Notes a file or folder whose name contains a backslash. Entry points and references store "/" instead of
/// it, so they cannot find the file again.
/// @param path relative to the root.
void checkName(std::u16string_view path, ShownPaths& shown, Findings& findings);

} // namespace projectctl
