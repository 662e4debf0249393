#pragma once

#include <string>

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"

namespace projectctl {

/// Notes a file or folder whose name holds a backslash. What is stored of entry points and references has "/"
/// for it, and so does not lead back.
/// @param path relative to the root.
void checkName(std::u16string_view path, ShownPaths& shown, Findings& findings);

} // namespace projectctl
