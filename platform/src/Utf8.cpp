#include "fl/i18n/Utf8.hpp"

#include <algorithm>

#include "fl/i18n/CodePoints.hpp"

namespace fl::i18n {

namespace {

constexpr char32_t replacement = 0xFFFD;

} // namespace

std::string toUtf8(std::u16string_view text) {
    std::string utf8;
    utf8.reserve(text.size());
    while (!text.empty()) {
        char32_t const codePoint = takeCodePoint(text);
        appendUtf8(utf8, isSurrogate(codePoint) ? replacement : codePoint);
    }
    return utf8;
}

std::u16string fromUtf8(std::string_view text) {
    std::u16string utf16;
    utf16.reserve(text.size());
    for (std::size_t position = 0; position < text.size();) {
        auto const [codePoint, length] = decodeUtf8(text, position);
        appendUtf16(utf16, length == 0 ? replacement : codePoint);
        position += std::max<std::size_t>(length, 1);
    }
    return utf16;
}

} // namespace fl::i18n
