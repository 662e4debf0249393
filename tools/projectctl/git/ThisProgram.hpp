#pragma once

#include <string>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

// Git's configuration calls this program by its absolute path, through a shell.

/// The path of this program.
/// @throws Failure if it is unknown.
std::string thisProgram();

/// Whether a path leads to a program.
bool canBeRun(std::string const& program);

/// Sets a value in the configuration of the repository of a folder, in place of all earlier ones.
/// @throws Failure if git refuses.
void configureGit(fl::filesystem::Path const& folder, char const* key, std::string const& value);

} // namespace projectctl
