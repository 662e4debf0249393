#include "fl/i18n/JsonString.hpp"

#include <algorithm>
#include <cstddef>

#include "fl/i18n/CodePoints.hpp"

namespace fl::i18n {

namespace {

constexpr char lowerDigits[] = "0123456789abcdef";

/// True for a code unit that every string contains as one byte.
constexpr bool isPlain(char16_t unit) noexcept {
    return unit >= 0x20 && unit < 0x7F && unit != u'"' && unit != u'\\';
}

void appendEscaped(std::string& out, char32_t unit) {
    out += '\\';
    if (char const letter = jsonEscapeLetter(unit)) {
        out += letter;
        return;
    }
    out += 'u';
    for (unsigned shift = 16; shift > 0;) {
        shift -= 4;
        out += lowerDigits[(unit >> shift) & 0xFU];
    }
}

/// Takes the longest plain beginning off the text and appends it: most strings are plain from end to end.
void appendPlain(std::string& out, std::u16string_view& text) {
    auto const end = std::find_if_not(text.begin(), text.end(), isPlain);
    auto const length = static_cast<std::size_t>(end - text.begin());
    if (length == 0) {
        return;
    }
    std::size_t const size = out.size();
    out.resize(size + length);
    std::transform(text.begin(), end, out.data() + size,
                   [](char16_t unit) { return static_cast<char>(unit); });
    text.remove_prefix(length);
}

bool isEscaped(char32_t character, JsonEscapes escapes) noexcept {
    bool const isRequired =
        character < 0x20 || character == U'"' || character == U'\\' || isSurrogate(character);
    return isRequired || (escapes == JsonEscapes::Controls && character >= 0x7F && character < 0xA0);
}

} // namespace

void appendJsonContent(std::string& out, std::u16string_view text, JsonEscapes escapes) {
    for (appendPlain(out, text); !text.empty(); appendPlain(out, text)) {
        char32_t const character = takeCodePoint(text);
        if (isEscaped(character, escapes)) {
            appendEscaped(out, character);
        } else {
            appendUtf8(out, character);
        }
    }
}

void appendJsonString(std::string& out, std::u16string_view text, JsonEscapes escapes) {
    out += '"';
    appendJsonContent(out, text, escapes);
    out += '"';
}

} // namespace fl::i18n
