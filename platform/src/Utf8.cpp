#include "fl/i18n/Utf8.hpp"

#include <unicode/unistr.h>

namespace fl::i18n {

std::string toUtf8(std::u16string_view text) {
    std::string utf8;
    icu::UnicodeString(false, text.data(), static_cast<int32_t>(text.size())).toUTF8String(utf8);
    return utf8;
}

std::u16string fromUtf8(std::string_view text) {
    auto const utf16 =
        icu::UnicodeString::fromUTF8(icu::StringPiece(text.data(), static_cast<int32_t>(text.size())));
    return {utf16.getBuffer(), static_cast<std::size_t>(utf16.length())};
}

} // namespace fl::i18n
