#pragma once

#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace fl::filesystem {

/// The text for the bytes of a name on disk. Valid UTF-8 becomes what it stands for; each other byte becomes
/// the lone surrogate U+DC00 plus the byte, which no valid UTF-8 gives, so that different bytes always give
/// different texts.
std::u16string decodeName(std::string_view bytes);

/// Writes the bytes that decodeName gives this text for.
/// @param out room for them; three bytes for each code unit and three more are always enough.
/// @return their number; nothing when there are no such bytes, the text holds a NUL, or the room may not do:
///         it does when three bytes are left over behind the name.
std::optional<std::size_t> encodeName(std::u16string_view text, std::span<char> out) noexcept;

} // namespace fl::filesystem
