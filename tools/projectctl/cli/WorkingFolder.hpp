#pragma once

#include <string>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

/// The folder in which the tool was called, canonical.
/// @throws Failure when it does not exist any more.
fl::filesystem::Path workingFolder();

/// Changes the current folder, as if the tool had been called there.
/// @param folder bytes of an argument, relative to the current folder or absolute. Nothing happens if it is
/// empty.
/// @throws Failure if it is not a folder that can be entered.
void enterFolder(std::string const& folder);

} // namespace projectctl
