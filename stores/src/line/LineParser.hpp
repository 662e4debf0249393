#pragma once

#include <optional>
#include <string_view>

#include "project/stores/Change.hpp"

namespace project::stores {

/// A line that was read, or why it could not be.
struct ParsedLine {
    std::optional<Change> change;
    char const* problem; ///< a clause; null when there is a change
};

/// Reads any line of a body or a batch, however its JSON is laid out.
ParsedLine parseLine(std::string_view line);

/// Reads a line of a body, where nothing is removed.
ParsedLine parseBodyLine(std::string_view line);

/// The node of a line that parses, null for one of an address that was made without.
Node nodeOfLine(std::string_view line);

} // namespace project::stores
