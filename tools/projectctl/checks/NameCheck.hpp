#pragma once

#include <string>

#include "checks/Finding.hpp"

namespace projectctl {

/// Notes a file or folder whose name holds a backslash. What is stored of entry points and references has "/"
/// for it, and so does not lead back.
/// @param path relative to the project's root.
void checkName(std::u16string const& path, Findings& findings);

} // namespace projectctl
