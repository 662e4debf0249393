#pragma once

#include <cstddef>
#include <string>
#include <string_view>

/// UTF-8 and UTF-16, one code point at a time. All code in the library that decodes or encodes text uses
/// these functions. None of them allocates, except appendUtf8, and none throws.
namespace fl::i18n {

/// The first code point that UTF-8 writes with more than one byte.
inline constexpr char32_t firstBeyondAscii = 0x80;
inline constexpr char32_t firstOfFourBytes =
    0x10000; ///< the first code point with a pair of surrogates in UTF-16
/// The last code point of Unicode.
inline constexpr char32_t lastCodePoint = 0x10FFFF;

/// The number of bytes of the longest code point in UTF-8.
inline constexpr std::size_t longestUtf8 = 4;

/// Returns true for the first unit of a pair in UTF-16.
constexpr bool isHighSurrogate(char32_t unit) noexcept {
    return unit >= 0xD800 && unit <= 0xDBFF;
}

/// Returns true for the second unit of a pair in UTF-16.
constexpr bool isLowSurrogate(char32_t unit) noexcept {
    return unit >= 0xDC00 && unit <= 0xDFFF;
}

/// Returns true for either unit of a pair.
constexpr bool isSurrogate(char32_t unit) noexcept {
    return unit >= 0xD800 && unit <= 0xDFFF;
}

/// The two UTF-16 code units of a code point from firstOfFourBytes on.
constexpr char16_t highSurrogate(char32_t codePoint) noexcept {
    return static_cast<char16_t>(0xD800U + ((codePoint - firstOfFourBytes) >> 10U));
}

/// Returns the second unit of the pair for a code point beyond 0xFFFF.
constexpr char16_t lowSurrogate(char32_t codePoint) noexcept {
    return static_cast<char16_t>(0xDC00U + ((codePoint - firstOfFourBytes) & 0x3FFU));
}

/// Takes the first code point off a UTF-16 text that is not empty. A surrogate without its partner is
/// returned as it is; isSurrogate is true for it.
constexpr char32_t takeCodePoint(std::u16string_view& text) noexcept {
    char32_t const unit = text.front();
    text.remove_prefix(1);
    if (!isHighSurrogate(unit) || text.empty() || !isLowSurrogate(text.front())) {
        return unit;
    }
    char32_t const low = text.front();
    text.remove_prefix(1);
    return firstOfFourBytes + ((unit - 0xD800U) << 10U) + (low - 0xDC00U);
}

/// Appends a code point as UTF-16.
inline void appendUtf16(std::u16string& out, char32_t codePoint) {
    if (codePoint < firstOfFourBytes) {
        out += static_cast<char16_t>(codePoint);
    } else {
        out += highSurrogate(codePoint);
        out += lowSurrogate(codePoint);
    }
}

/// Writes a code point that is not a surrogate as UTF-8. @return the number of bytes, at most longestUtf8.
constexpr std::size_t writeUtf8(char32_t codePoint, char* out) noexcept {
    auto const write = [](char* at, char32_t byte) {
        *at = static_cast<char>(static_cast<unsigned char>(byte));
    };
    auto const continuation = [codePoint](unsigned shift) { return 0x80U | ((codePoint >> shift) & 0x3FU); };
    if (codePoint < firstBeyondAscii) {
        write(out, codePoint);
        return 1;
    }
    if (codePoint < 0x800) {
        write(out, 0xC0U | (codePoint >> 6U));
        write(out + 1, continuation(0));
        return 2;
    }
    if (codePoint < firstOfFourBytes) {
        write(out, 0xE0U | (codePoint >> 12U));
        write(out + 1, continuation(6));
        write(out + 2, continuation(0));
        return 3;
    }
    write(out, 0xF0U | (codePoint >> 18U));
    write(out + 1, continuation(12));
    write(out + 2, continuation(6));
    write(out + 3, continuation(0));
    return 4;
}

/// Appends a code point that is not a surrogate as UTF-8.
inline void appendUtf8(std::string& out, char32_t codePoint) {
    char bytes[longestUtf8];
    out.append(bytes, writeUtf8(codePoint, bytes));
}

/// A code point and the number of bytes that it has in UTF-8; 0 where the bytes are not well-formed UTF-8.
struct Utf8CodePoint {
    char32_t codePoint; ///< the decoded character
    std::size_t length; ///< the number of its bytes
};

/// Decodes the code point at a position within the bytes. Overlong forms, surrogates, code points beyond the
/// last one and sequences that are cut off are not well-formed.
constexpr Utf8CodePoint decodeUtf8(std::string_view bytes, std::size_t position) noexcept {
    auto const byte = [&](std::size_t index) {
        return static_cast<char32_t>(static_cast<unsigned char>(bytes[position + index]));
    };
    constexpr Utf8CodePoint malformed = {0, 0};
    char32_t const lead = byte(0);
    if (lead < firstBeyondAscii) {
        return {lead, 1};
    }
    if (lead < 0xC2 || lead > 0xF4) {
        return malformed;
    }
    std::size_t const length = lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : 4;
    if (length > bytes.size() - position) {
        return malformed;
    }
    char32_t codePoint = lead & (0x7FU >> length);
    for (std::size_t index = 1; index < length; ++index) {
        if ((byte(index) & 0xC0U) != 0x80U) {
            return malformed;
        }
        codePoint = (codePoint << 6U) | (byte(index) & 0x3FU);
    }
    char32_t const first = length == 2 ? firstBeyondAscii : length == 3 ? char32_t{0x800} : firstOfFourBytes;
    bool const isWellFormed = codePoint >= first && codePoint <= lastCodePoint && !isSurrogate(codePoint);
    return isWellFormed ? Utf8CodePoint{codePoint, length} : malformed;
}

} // namespace fl::i18n
