#pragma once

#include <cstddef>
#include <cstring>
#include <string_view>

namespace fl::i18n {

// Nearly all names are ASCII. These functions convert them eight characters at a time, with the compiler's
// vectors: an optimiser does not vectorise the plain loops at the level at which distributions build.

namespace detail {

inline constexpr std::size_t blockLength = 8;
using WideBlock = unsigned short __attribute__((vector_size(2 * blockLength)));
using NarrowBlock = unsigned char __attribute__((vector_size(blockLength)));

} // namespace detail

/// Copies text of the characters U+0001 to U+007F.
/// @param to memory for a byte for each code unit.
/// @return false if the text contains another character; the copy is then useless.
inline bool narrowAscii(std::u16string_view text, char* to) noexcept {
    detail::WideBlock seen{};
    std::size_t at = 0;
    for (; at + detail::blockLength <= text.size(); at += detail::blockLength) {
        detail::WideBlock block;
        std::memcpy(&block, text.data() + at, sizeof block);
        seen |= block | reinterpret_cast<detail::WideBlock>(block == 0);
        auto const narrow = __builtin_convertvector(block, detail::NarrowBlock);
        std::memcpy(to + at, &narrow, sizeof narrow);
    }
    unsigned isOther = 0;
    for (std::size_t i = 0; i < detail::blockLength; ++i) {
        isOther |= seen[i] & 0xFF80U;
    }
    for (; at < text.size(); ++at) {
        isOther |= text[at] == 0 ? 1U : text[at] & 0xFF80U;
        to[at] = static_cast<char>(text[at]);
    }
    return isOther == 0;
}

/// Copies bytes of the values 0 to 0x7F.
/// @param to memory for a code unit for each byte.
/// @return false if there is another value; the copy is then useless.
inline bool widenAscii(std::string_view bytes, char16_t* to) noexcept {
    detail::NarrowBlock seen{};
    std::size_t at = 0;
    for (; at + detail::blockLength <= bytes.size(); at += detail::blockLength) {
        detail::NarrowBlock block;
        std::memcpy(&block, bytes.data() + at, sizeof block);
        seen |= block;
        auto const wide = __builtin_convertvector(block, detail::WideBlock);
        std::memcpy(to + at, &wide, sizeof wide);
    }
    unsigned values = 0;
    for (std::size_t i = 0; i < detail::blockLength; ++i) {
        values |= seen[i];
    }
    for (; at < bytes.size(); ++at) {
        auto const value = static_cast<unsigned char>(bytes[at]);
        values |= value;
        to[at] = value;
    }
    return values < 0x80;
}

} // namespace fl::i18n
