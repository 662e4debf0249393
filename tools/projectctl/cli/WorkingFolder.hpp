#pragma once

#include "fl/filesystem/Path.hpp"

namespace projectctl {

/// The folder in which the tool was called, canonical.
/// @throws Failure when it does not exist any more.
fl::filesystem::Path workingFolder();

} // namespace projectctl
