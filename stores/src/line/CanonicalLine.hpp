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

/// The length of the path if a text begins with a path of plain ASCII characters in quotes; 0 for every other
/// text. This is the fast path of reading: canonicalAddress accepts all lines that are such a path, and
/// others.
std::size_t plainPathLength(std::string_view text) noexcept;

} // namespace project::stores
