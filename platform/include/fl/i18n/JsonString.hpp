#pragma once

#include <string>
#include <string_view>

#include "PlatformExport.hpp"

namespace fl::i18n {

// JSON strings in UTF-8. The part between the quotes is called the content. Any sequence of UTF-16 code units
// has a content: a surrogate without its partner has no UTF-8 and is escaped.

/// The characters that are escaped although JSON does not require it.
enum class JsonEscapes {
    Required, ///< none: the shortest content
    Controls, ///< U+007F to U+009F, which terminals obey as control characters
};

/// Appends the content of a text, without quotes. The escape of a character is the one with a letter where
/// JSON has one, else `\u` with lower-case digits.
PROJECT_PLATFORM_EXPORT void appendJsonContent(std::string& out, std::u16string_view text,
                                               JsonEscapes escapes = JsonEscapes::Required);

/// Appends a text as a JSON string, with its quotes.
PROJECT_PLATFORM_EXPORT void appendJsonString(std::string& out, std::u16string_view text,
                                              JsonEscapes escapes = JsonEscapes::Required);

/// The letter after the backslash in the two-character escape of a character that a string must escape; 0 for
/// a character without such an escape.
constexpr char jsonEscapeLetter(char32_t character) noexcept {
    switch (character) {
    case U'"':
        return '"';
    case U'\\':
        return '\\';
    case U'\b':
        return 'b';
    case U'\f':
        return 'f';
    case U'\n':
        return 'n';
    case U'\r':
        return 'r';
    case U'\t':
        return 't';
    default:
        return 0;
    }
}

} // namespace fl::i18n
