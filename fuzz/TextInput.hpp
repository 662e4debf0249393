#pragma once

#include <array>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "text/ProjectText.hpp"

namespace project::fuzz {

/// A text with these lines in its body, and with this tail.
std::string framed(std::string_view lines, std::string_view tail = {});

/// The tail that an input describes. A line "#" becomes the correct closing line of a batch, with the number
/// of its lines, the checksum that precedes it, and its own checksum: a fuzzer could never guess these. "#!"
/// becomes a closing line that does not name the preceding checksum, "#?" one with a wrong checksum of its
/// own, and "#" with a number one that claims this number of lines. All other lines are taken as they are.
/// @return consecutive pieces of the tail, each except perhaps the last one up to a closing line.
std::vector<std::string> tailOf(std::string_view input, std::string_view body);

/// The text that an input describes. An input that begins like a text, or with a conflict marker, is the text
/// itself. Any other input contains the lines of a body and, after a line "+", those of a tail.
std::string textOf(std::string_view input);

/// The three parts of an input, which lines "---" separate. Missing parts are empty.
std::array<std::string_view, 3> partsOf(std::string_view input);

/// @return nothing for bytes that are refused or incomplete.
std::optional<stores::ProjectText> readText(std::string bytes);

} // namespace project::fuzz
