#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace projectctl {

/// The shells whose quoting a typed line can have.
enum class Shell { Bash, Fish };

/// A command line up to the cursor, as a person typed it in a shell. Nothing in it is expanded.
struct TypedLine {
    enum class Quote { None, Single, Double };

    std::vector<std::string> words; ///< without quotes; the last one is being typed, and may be empty
    Quote quote = Quote::None;      ///< the one that is open at the end
};

TypedLine readTypedLine(std::string_view text, Shell shell);

/// The arguments in a line: the words after the program's name, which variables may precede.
std::vector<std::string> argumentsOf(TypedLine const& line);

/// A text in a form that means the same to bash after a given quote.
std::string quotedForBash(std::string_view text, TypedLine::Quote open);

} // namespace projectctl
