#pragma once

#include <optional>
#include <string_view>

#include "line/LineAddress.hpp"

namespace project::stores {

/// The address of a canonical line of a body, as a view of the line; nothing for every other line, damaged or
/// only written differently.
///
/// Checks the whole line but builds nothing from it, because most lines that are read are never requested.
std::optional<LineAddress> canonicalAddress(std::string_view line) noexcept;

/// The address of a line that canonicalAddress accepted.
LineAddress addressOfCanonical(std::string_view line) noexcept;

/// The length of the path if a line is a path of plain ASCII characters in quotes; 0 for every other line.
/// This is the fast path of reading: canonicalAddress accepts all of these lines, and others.
/// @param line the first byte of the line, followed somewhere by a byte that is not a plain character.
std::size_t plainPathLength(char const* line) noexcept;

} // namespace project::stores
