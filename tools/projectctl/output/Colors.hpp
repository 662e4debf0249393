#pragma once

#include <string>
#include <string_view>

namespace projectctl {

/// The meaning of a text that has a colour on a terminal.
enum class Color {
    Heading, ///< of help
    Fault,   ///< also the beginning of an error
    Warning, ///< also the beginning of a hint
    Note,
    New,      ///< a file that is on disk only
    Gone,     ///< a file that is in the project only
    FilePath, ///< beside other data
};

/// When the tool writes colours.
enum class ColorUse { Auto, Always, Never };

/// Decides when standard output and standard error are coloured, before anything is written and before a
/// pager takes the place of the terminal. Until then, it is Auto.
///
/// Auto asks in this order: NO_COLOR, if it is not empty, means never. CLICOLOR_FORCE, if it is not empty and
/// not "0", means always. Otherwise an output is coloured if it is a terminal that is not dumb, according to
/// TERM.
void useColors(ColorUse use);

/// A text on standard output, in its colour if standard output is coloured.
std::string colored(Color color, std::string text);

/// A text on standard error, in its colour if standard error is coloured.
std::string coloredError(Color color, std::string text);

/// The bytes that begin and end a colour on standard output; empty if it is not coloured.
std::string_view beginOf(Color color);
std::string_view endOfColor();

} // namespace projectctl
