#pragma once

#include <string_view>

namespace project::git {

/// How a pattern of a `.gitignore` is compared.
struct WildcardMode {
    bool isPath;        ///< only "/" and "**" match a slash
    bool isCaseIgnored; ///< of ASCII letters
};

/// Whether the whole of a text matches a pattern with git's wildcards (gitignore(5)): "?", "*", "**" between
/// slashes, "[a-z]", "[!a]", "[[:digit:]]", and a backslash before a literal character. Compares bytes, as
/// git does.
///
/// A pattern much longer than any path matches nothing. Time and memory are at most proportional to the
/// product of both lengths.
bool isWildcardMatch(std::string_view pattern, std::string_view text, WildcardMode mode);

} // namespace project::git
