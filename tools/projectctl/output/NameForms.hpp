#pragma once

#include <string>
#include <string_view>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

// A file name can be any sequence of bytes. The library stores it as UTF-16 code units, with a lone surrogate
// for each byte that is not valid UTF-8. These functions convert it to the form in which the user sees it.

/// Appends a name or path as the bytes that it has on disk. A text that cannot be a file name, which only a
/// damaged store contains, is appended as UTF-8, with U+FFFD for each character that is not valid.
void appendBytes(std::string& out, std::u16string_view name);

/// The same as a text of its own.
std::string bytesOf(std::u16string_view name);

/// The text of an argument. Bytes that are not valid UTF-8 are preserved.
std::u16string textOf(std::string const& argument);

/// Appends the bytes of a name or path in a form that is safe for a terminal. If they contain control
/// characters, invalid UTF-8, quotes or backslashes, they are written in double quotes with C escapes: no
/// name can be mistaken for another one or control the terminal. Otherwise they are appended unchanged.
void appendQuoted(std::string& out, std::string_view bytes);

/// The same of a name or path.
std::string quotedName(std::u16string_view name);

/// Appends text as a JSON string in UTF-8. Text that is not valid UTF-16 is preserved: a lone surrogate is
/// escaped, so that the byte 0x80 of a name on disk becomes \udc80.
void appendJsonString(std::string& out, std::u16string_view text);

/// Text in double quotes for a message, in UTF-8.
std::string inQuotes(std::u16string_view text);

/// A path for a message, in UTF-8.
std::string shown(fl::filesystem::Path const& path);

/// Bytes as one word for a shell, in single quotes.
std::string quotedForShell(std::string_view bytes);

/// Text in a form that is safe for a terminal: control characters other than tabs are replaced by C escapes.
/// @param lineBreaks whether line feeds are kept.
std::string withoutControls(std::string_view text, bool lineBreaks);

} // namespace projectctl
