#pragma once

#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace fl::filesystem {

/// Returns the text for the bytes of a name on disk. Valid UTF-8 is decoded. Each other byte becomes the lone
/// surrogate U+DC00 plus the byte, which valid UTF-8 never produces, so that different bytes have different
/// texts.
std::u16string decodeName(std::string_view bytes);

/// Writes the bytes for which decodeName returns this text.
/// @param out room for them; three bytes for each code unit and three more are always enough.
/// @return their number; nothing if there are no such bytes, if the text contains a NUL, or if the room has
///         fewer than three bytes left after the name.
std::optional<std::size_t> encodeName(std::u16string_view text, std::span<char> out) noexcept;

} // namespace fl::filesystem
