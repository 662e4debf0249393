#pragma once

#include <string_view>

namespace project::git {

/// How a pattern of a `.gitignore` is compared.
struct WildcardMode {
    bool isPath;      ///< "/" is matched by nothing but itself and "**"
    bool ignoresCase; ///< of ASCII letters
};

/// Whether a whole text matches a pattern with git's wildcards (gitignore(5)): "?", "*", "**" between
/// slashes,
/// "[a-z]", "[!a]", "[[:digit:]]", and a backslash before what is meant as it is. All are bytes, as in git.
///
/// A pattern much longer than any path matches nothing. Takes at most time and memory in proportion to the
/// lengths of both, multiplied.
bool matchesWildcards(std::string_view pattern, std::string_view text, WildcardMode mode);

} // namespace project::git
