#pragma once

#include <compare>
#include <cstddef>
#include <string>
#include <string_view>

namespace project::stores {

// The strings of the text. Between its quotes a string is called content: UTF-8, in which ", \ and control
// characters are escaped, and a surrogate without its partner too, since no UTF-8 has a form for it. So any
// sequence of code units has one canonical content, and every content stands for one sequence.

/// Appends the canonical content of a text, without quotes.
void appendJsonContent(std::string& out, std::u16string_view text);

/// Appends a text as a canonical JSON string, with its quotes.
void appendJsonString(std::string& out, std::u16string_view text);

/// The text that a content stands for. @param content must have passed scanJsonContent.
std::u16string decodeJsonContent(std::string_view content);

/// Compares the texts of two canonical contents by code units, without decoding them where nothing is
/// escaped near the first difference.
std::strong_ordering compareJsonContents(std::string_view left, std::string_view right) noexcept;

/// What scanJsonContent found.
struct JsonContentScan {
    std::size_t end;     ///< where the closing quote stands; of no meaning when there is a problem
    bool canonical;      ///< the content is what appendJsonContent would write
    char const* problem; ///< null when the content is well-formed up to its closing quote
};

/// Checks a string's content from its first byte to its closing quote: UTF-8, escapes, control characters.
/// Escaped surrogates may stand alone.
JsonContentScan scanJsonContent(std::string_view text, std::size_t from) noexcept;

/// Where two texts first differ, or the length of the shorter one.
std::size_t firstDifference(std::string_view left, std::string_view right) noexcept;

/// True when no escape begins at a position of a canonical content or right before it. Where two contents
/// first differ so, their bytes compare as their texts do: raw characters by codeUnitRank, and so do the
/// digits within an escape.
inline bool isUnescapedAt(std::string_view content, std::size_t position) noexcept {
    return content[position] != '\\' && (position == 0 || content[position - 1] != '\\');
}

/// A place for each byte such that comparing raw UTF-8 by it gives the order of UTF-16 code units: characters
/// of four bytes are surrogates there, which come before U+E000 to U+FFFF.
inline int codeUnitRank(unsigned char byte) noexcept {
    return byte == 0xEE || byte == 0xEF ? byte + 0x10 : byte;
}

} // namespace project::stores
