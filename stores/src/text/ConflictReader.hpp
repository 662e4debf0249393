#pragma once

#include <optional>
#include <string>
#include <utility>

#include "text/TextReader.hpp"

namespace project::stores {

/// Reads a text with conflict markers: as two texts, each with the lines outside the markers and those of one
/// side, which are then joined. Nothing of either side is lost, so content that one side removed is present
/// again. Lines of the common ancestor are ignored.
///
/// Arguments and result are those of readText.
std::optional<TextReading> readConflictedText(std::string bytes, std::string const& file);

/// The two texts that a text with conflict markers is read as.
std::pair<std::string, std::string> sidesOfConflictedText(std::string const& bytes);

} // namespace project::stores
