#pragma once

#include <optional>
#include <string>

#include "text/TextReader.hpp"

namespace project::stores {

/// Reads a text in which a merge left markers: as two texts, each with the lines outside the markers and
/// those of one side, and then joined. Nothing of either side is lost, so that what one side removed is
/// there again. Lines of the common ancestor do not count.
///
/// Arguments and result as of readText.
std::optional<TextReading> readConflictedText(std::string bytes, std::string const& file);

} // namespace project::stores
