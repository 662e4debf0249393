#pragma once

#include <array>
#include <compare>
#include <cstddef>
#include <initializer_list>
#include <stdexcept>
#include <string>
#include <string_view>

#include "fl/i18n/JsonString.hpp"

namespace project::stores {

// The strings of the text. The content of a string is the bytes between its quotes: UTF-8 in which ", \ and
// control characters are escaped, and so is a surrogate without its partner, which UTF-8 cannot encode. Each
// sequence of code units has one canonical content, and each content represents one sequence.

using fl::i18n::appendJsonContent;
using fl::i18n::appendJsonString;

/// The content of constants that are written without escapes, computed by the compiler.
class ConstantContent {
public:
    /// @param parts printable ASCII; they are joined.
    consteval ConstantContent(std::initializer_list<std::u16string_view> parts) {
        for (std::u16string_view const part : parts) {
            for (char16_t const unit : part) {
                if (unit >= 0x7F) {
                    throw std::invalid_argument("not ASCII");
                }
                bytes_.at(size_++) = static_cast<char>(unit);
            }
        }
    }

    constexpr operator std::string_view() const noexcept { return {bytes_.data(), size_}; }

private:
    std::array<char, 32> bytes_{};
    std::size_t size_ = 0;
};

/// The text that a content represents. @param content well-formed according to scanJsonContent.
std::u16string decodeJsonContent(std::string_view content);

/// The same in place of an earlier text, whose memory is used again.
void decodeJsonContent(std::string_view content, std::u16string& text);

/// Compares the texts of two canonical contents by code units. Decodes them only if there is an escape at the
/// first difference.
std::strong_ordering compareJsonContents(std::string_view left, std::string_view right) noexcept;

/// The result of scanJsonContent.
struct JsonContentScan {
    std::size_t end;     ///< the position of the closing quote; undefined if there is a problem
    bool isCanonical;    ///< appendJsonContent would write the same bytes
    char const* problem; ///< the name of a text; null if the content is well-formed up to its closing quote
};

/// Checks the content of a string from its first byte to its closing quote: UTF-8, escapes, control
/// characters. An escaped surrogate may lack its partner.
JsonContentScan scanJsonContent(std::string_view text, std::size_t from) noexcept;

/// The first position at which two texts differ, or the length of the shorter one.
std::size_t firstDifference(std::string_view left, std::string_view right) noexcept;

/// True if no escape begins at or directly before a position of a canonical content. If this holds at the
/// first difference of two contents, their bytes compare by codeUnitRank as their texts do, even when both
/// bytes are digits of an escape.
inline bool isUnescapedAt(std::string_view content, std::size_t position) noexcept {
    return content[position] != '\\' && (position == 0 || content[position - 1] != '\\');
}

/// The rank of a byte. Comparing UTF-8 by rank gives the order of UTF-16 code units, in which characters of
/// four bytes are surrogates and come before U+E000 to U+FFFF.
inline int codeUnitRank(unsigned char byte) noexcept {
    return byte == 0xEE || byte == 0xEF ? byte + 0x10 : byte;
}

} // namespace project::stores
