#pragma once

#include <optional>

#include "project/OpenProject.hpp"

namespace projectctl {

/// The path of the project that a user probably meant by one that is not in the project.
/// @param path absolute. @return empty if no path is near enough.
std::optional<Path> meantPath(OpenProject& project, Path const& path);

} // namespace projectctl
