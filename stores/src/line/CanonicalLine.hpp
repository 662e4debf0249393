#pragma once

#include <optional>
#include <string_view>

#include "line/LineAddress.hpp"

namespace project::stores {

/// The address of a line of the body that is written canonically, to the byte, a view of the line; nothing
/// for any other line, be it damaged or only written differently.
///
/// Checks the whole line without building anything from it, since most lines that are read are never asked
/// for.
std::optional<LineAddress> canonicalAddress(std::string_view line) noexcept;

/// The address of a line that canonicalAddress took.
LineAddress addressOfCanonical(std::string_view line) noexcept;

/// How long the content of the path is when a line, which must have a byte behind it that is no plain
/// character, is just a path of plain ASCII characters in quotes; 0 for any other line. The fast road of
/// reading: a part of what canonicalAddress takes.
/// @param line the first byte of the line, its quote.
std::size_t plainPathLength(char const* line) noexcept;

} // namespace project::stores
