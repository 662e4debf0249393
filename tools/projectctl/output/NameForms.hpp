#pragma once

#include <string>
#include <string_view>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

// A name of a file is any bytes. The library keeps it as UTF-16 code units, with a lone surrogate for each
// byte that is no UTF-8; here it takes the form in which it is to be shown.

/// Appends a name or path as the bytes that it has on disk. Text that no file can have for a name, which only
/// a damaged store holds, comes with U+FFFD in it.
void appendBytes(std::string& out, std::u16string_view name);

/// The text of an argument: bytes that are no UTF-8 stay what they are.
std::u16string textOf(std::string const& argument);

/// Appends bytes of a name or path for a terminal: in double quotes with C escapes when they hold control
/// characters, bytes that are no UTF-8, quotes or backslashes, so that no name can be taken for another one
/// or steer the terminal; else as they are.
void appendQuoted(std::string& out, std::string_view bytes);

/// Appends text as a JSON string in UTF-8. What is no valid text stays exact: a lone surrogate is escaped, so
/// that the byte 0x80 of a name on disk is \udc80.
void appendJsonString(std::string& out, std::u16string_view text);

/// Text in double quotes for a message, in UTF-8.
std::string inQuotes(std::u16string_view text);

/// A path for a message, in UTF-8.
std::string shown(fl::filesystem::Path const& path);

/// Text made fit for a line of a terminal: control characters other than tabs come as C escapes.
/// @param lineBreaks whether line feeds may stay.
std::string withoutControls(std::string_view text, bool lineBreaks);

} // namespace projectctl
