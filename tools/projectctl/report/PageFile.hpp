#pragma once

#include <string_view>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

/// Writes a file as a whole: a reader, and a failure, find the old content or the new one. The new content is
/// first written to a temporary file beside it.
/// @throws Failure if the file cannot be written. Then nothing has changed.
void replaceFile(fl::filesystem::Path const& file, std::string_view content);

} // namespace projectctl
