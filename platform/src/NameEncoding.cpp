#include "NameEncoding.hpp"

#include <algorithm>
#include <array>

namespace fl::filesystem {

namespace {

constexpr char32_t firstAfterAscii = 0x80;
constexpr char32_t firstOfThreeBytes = 0x800;
constexpr char32_t firstOfFourBytes = 0x10000;
constexpr char32_t lastCodePoint = 0x10FFFF;

/// A byte that is no valid UTF-8 is kept as the lone low surrogate of this plus the byte.
constexpr char32_t escapeBase = 0xDC00;

constexpr bool isHighSurrogate(char32_t unit) {
    return unit >= 0xD800 && unit <= 0xDBFF;
}

constexpr bool isLowSurrogate(char32_t unit) {
    return unit >= 0xDC00 && unit <= 0xDFFF;
}

constexpr bool isSurrogate(char32_t unit) {
    return unit >= 0xD800 && unit <= 0xDFFF;
}

constexpr bool isEscapedByte(char32_t unit) {
    return unit >= escapeBase + 0x80 && unit <= escapeBase + 0xFF;
}

/// What stands at one place of a name: a code point, or an escaped byte.
struct Decoded {
    char32_t codePoint;
    std::size_t length;
};

/// How many bytes a sequence takes that begins with this one; 0 when none does.
constexpr std::size_t sequenceLength(unsigned char lead) {
    if (lead < 0x80) {
        return 1;
    }
    if (lead < 0xC2 || lead > 0xF4) {
        return 0;
    }
    return lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : 4;
}

/// True for what a sequence of this length may stand for: no longer form than needed, no surrogates.
constexpr bool isWellFormed(char32_t codePoint, std::size_t length) {
    constexpr std::array<char32_t, 5> first = {0, 0, firstAfterAscii, firstOfThreeBytes, firstOfFourBytes};
    return codePoint >= first[length] && codePoint <= lastCodePoint && !isSurrogate(codePoint);
}

/// Reads the code point at the beginning of the bytes, of which there is at least one.
Decoded decodeFirst(std::string_view bytes) noexcept {
    auto const lead = static_cast<unsigned char>(bytes.front());
    Decoded const escaped = {escapeBase + lead, 1};
    auto const length = sequenceLength(lead);
    if (length == 0 || length > bytes.size()) {
        return escaped;
    }
    char32_t codePoint = length == 1 ? lead : lead & (0x7FU >> length);
    for (auto const byte : bytes.substr(1, length - 1)) {
        auto const bits = static_cast<unsigned char>(byte);
        if ((bits & 0xC0U) != 0x80U) {
            return escaped;
        }
        codePoint = (codePoint << 6U) | (bits & 0x3FU);
    }
    return isWellFormed(codePoint, length) ? Decoded{codePoint, length} : escaped;
}

/// Gives the code units that the bytes stand for to a function, one by one, for as long as it answers true.
template <typename Function>
bool forEachUnit(std::string_view bytes, Function&& take) {
    while (!bytes.empty()) {
        auto const [codePoint, length] = decodeFirst(bytes);
        bytes.remove_prefix(length);
        bool goesOn = false;
        if (codePoint < firstOfFourBytes) {
            goesOn = take(static_cast<char16_t>(codePoint));
        } else {
            auto const offset = codePoint - firstOfFourBytes;
            goesOn = take(static_cast<char16_t>(0xD800U + (offset >> 10U))) &&
                     take(static_cast<char16_t>(0xDC00U + (offset & 0x3FFU)));
        }
        if (!goesOn) {
            return false;
        }
    }
    return true;
}

/// True when the bytes stand for exactly this text.
bool decodesTo(std::string_view bytes, std::u16string_view text) noexcept {
    std::size_t at = 0;
    bool const isPrefix =
        forEachUnit(bytes, [&](char16_t unit) { return at < text.size() && text[at++] == unit; });
    return isPrefix && at == text.size();
}

/// Takes the code point at the beginning of the text off it.
char32_t takeCodePoint(std::u16string_view& text) noexcept {
    char32_t const unit = text.front();
    text.remove_prefix(1);
    if (!isHighSurrogate(unit) || text.empty() || !isLowSurrogate(text.front())) {
        return unit;
    }
    char32_t const low = text.front();
    text.remove_prefix(1);
    return firstOfFourBytes + ((unit - 0xD800U) << 10U) + (low - 0xDC00U);
}

constexpr std::size_t longestSequence = 4;

std::size_t writeByte(char32_t byte, char* out) noexcept {
    *out = static_cast<char>(static_cast<unsigned char>(byte));
    return 1;
}

/// Writes the UTF-8 of a code point that is no surrogate. @return its length.
std::size_t writeCodePoint(char32_t codePoint, char* out) noexcept {
    auto const writeTail = [&](unsigned shift, char* at) {
        return writeByte(0x80U | ((codePoint >> shift) & 0x3FU), at);
    };
    if (codePoint < firstAfterAscii) {
        return writeByte(codePoint, out);
    }
    if (codePoint < firstOfThreeBytes) {
        return writeByte(0xC0U | (codePoint >> 6U), out) + writeTail(0, out + 1);
    }
    if (codePoint < firstOfFourBytes) {
        return writeByte(0xE0U | (codePoint >> 12U), out) + writeTail(6, out + 1) + writeTail(0, out + 2);
    }
    return writeByte(0xF0U | (codePoint >> 18U), out) + writeTail(12, out + 1) + writeTail(6, out + 2) +
           writeTail(0, out + 3);
}

/// Writes what the text has in ASCII at its beginning, as far as there is room. @return its length.
std::size_t encodeAsciiPrefix(std::u16string_view text, std::span<char> out) noexcept {
    auto const limit = std::min(text.size(), out.size());
    std::size_t length = 0;
    while (length < limit && text[length] != 0 && text[length] < firstAfterAscii) {
        out[length] = static_cast<char>(text[length]);
        ++length;
    }
    return length;
}

} // namespace

std::u16string decodeName(std::string_view bytes) {
    std::u16string text;
    text.reserve(bytes.size());
    forEachUnit(bytes, [&](char16_t unit) {
        text += unit;
        return true;
    });
    return text;
}

std::optional<std::size_t> encodeName(std::u16string_view text, std::span<char> out) noexcept {
    auto length = encodeAsciiPrefix(text, out);
    bool hasEscapes = false;
    for (auto rest = text.substr(length); !rest.empty();) {
        auto const codePoint = takeCodePoint(rest);
        bool const isEscaped = isEscapedByte(codePoint);
        bool const hasBytes = codePoint != 0 && (isEscaped || !isSurrogate(codePoint));
        if (!hasBytes || out.size() - length < longestSequence) {
            return std::nullopt;
        }
        length += isEscaped ? writeByte(codePoint - escapeBase, out.data() + length)
                            : writeCodePoint(codePoint, out.data() + length);
        hasEscapes = hasEscapes || isEscaped;
    }
    // Escaped bytes that make a valid sequence together are the name of another text, not of this one.
    if (hasEscapes && !decodesTo({out.data(), length}, text)) {
        return std::nullopt;
    }
    return length;
}

} // namespace fl::filesystem
