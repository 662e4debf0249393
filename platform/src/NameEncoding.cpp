#include "NameEncoding.hpp"

#include <algorithm>

#include "fl/i18n/CodePoints.hpp"

namespace fl::filesystem {

namespace {

/// A byte that is not part of valid UTF-8 is kept as the lone low surrogate of this plus the byte.
constexpr char32_t escapeBase = 0xDC00;

constexpr bool isEscapedByte(char32_t unit) {
    return unit >= escapeBase + 0x80 && unit <= escapeBase + 0xFF;
}

/// Calls a function with the code points that the bytes form, one by one, as long as it returns true. A byte
/// that is not part of valid UTF-8 has the code point of its escape.
template <typename Function>
bool forEachCodePoint(std::string_view bytes, Function&& take) {
    for (std::size_t position = 0; position < bytes.size();) {
        auto [codePoint, length] = i18n::decodeUtf8(bytes, position);
        if (length == 0) {
            codePoint = escapeBase + static_cast<unsigned char>(bytes[position]);
            length = 1;
        }
        position += length;
        if (!take(codePoint)) {
            return false;
        }
    }
    return true;
}

/// True if the bytes are the name of exactly this text.
bool decodesTo(std::string_view bytes, std::u16string_view text) noexcept {
    std::size_t index = 0;
    auto const isNext = [&](char16_t unit) { return index < text.size() && text[index++] == unit; };
    bool const isPrefix = forEachCodePoint(bytes, [&](char32_t codePoint) {
        return codePoint < i18n::firstOfFourBytes
                   ? isNext(static_cast<char16_t>(codePoint))
                   : isNext(i18n::highSurrogate(codePoint)) && isNext(i18n::lowSurrogate(codePoint));
    });
    return isPrefix && index == text.size();
}

/// Writes the ASCII characters at the beginning of the text, as far as there is room. @return their number.
std::size_t encodeAsciiPrefix(std::u16string_view text, std::span<char> out) noexcept {
    std::size_t const limit = std::min(text.size(), out.size());
    std::size_t length = 0;
    while (length < limit && text[length] != 0 && text[length] < i18n::firstBeyondAscii) {
        out[length] = static_cast<char>(text[length]);
        ++length;
    }
    return length;
}

} // namespace

std::u16string decodeName(std::string_view bytes) {
    std::u16string text;
    text.reserve(bytes.size());
    forEachCodePoint(bytes, [&](char32_t codePoint) {
        i18n::appendUtf16(text, codePoint);
        return true;
    });
    return text;
}

std::optional<std::size_t> encodeName(std::u16string_view text, std::span<char> out) noexcept {
    std::size_t length = encodeAsciiPrefix(text, out);
    bool hasEscapes = false;
    for (auto rest = text.substr(length); !rest.empty();) {
        char32_t const codePoint = i18n::takeCodePoint(rest);
        bool const isEscaped = isEscapedByte(codePoint);
        bool const hasBytes = codePoint != 0 && (isEscaped || !i18n::isSurrogate(codePoint));
        if (!hasBytes || out.size() - length < i18n::longestUtf8) {
            return std::nullopt;
        }
        if (isEscaped) {
            out[length++] = static_cast<char>(static_cast<unsigned char>(codePoint - escapeBase));
        } else {
            length += i18n::writeUtf8(codePoint, out.data() + length);
        }
        hasEscapes = hasEscapes || isEscaped;
    }
    // Escaped bytes that form a valid sequence together are the name of another text, not of this one.
    if (hasEscapes && !decodesTo({out.data(), length}, text)) {
        return std::nullopt;
    }
    return length;
}

} // namespace fl::filesystem
