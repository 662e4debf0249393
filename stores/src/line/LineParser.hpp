#pragma once

#include <optional>
#include <string_view>

#include "line/AddressState.hpp"
#include "project/stores/Change.hpp"

namespace project::stores {

/// A line that was read, or the reason why it is unreadable.
struct ParsedLine {
    std::optional<Change> change;
    char const* problem; ///< the name of the text of a clause; null if there is a change
};

/// Reads any line of a body or a batch, whatever the order of its members and its white space.
ParsedLine parseLine(std::string_view line);

/// Reads a line of a body, which cannot contain removals.
ParsedLine parseBodyLine(std::string_view line);

/// True for a readable line that is a path alone, so that its address has the plain node.
inline bool isPlainPath(std::string_view line) noexcept {
    return line.starts_with('"');
}

/// The state that a readable line of a body gives to its address.
AddressState stateOfLine(std::string_view line);

} // namespace project::stores
