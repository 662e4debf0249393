#pragma once

#include "fl/filesystem/Path.hpp"

namespace projectctl {

/// Configures the repository of a folder so that `git diff` shows projects' texts in words: with a filter in
/// its configuration, and an attribute in its own file of attributes, so that nobody else's clone changes.
/// Where the program cannot be run or fails, git shows the lines of the text.
/// @throws Failure if git refuses, or if the file cannot be written.
void setUpDiff(fl::filesystem::Path const& folder);

/// Undoes that.
void removeDiffSetup(fl::filesystem::Path const& folder);

} // namespace projectctl
