#pragma once

#include <string_view>
#include <vector>

#include "Glob.hpp"

namespace projectctl {

/// A pattern of a CODEOWNERS file: one of .gitignore, with these differences: there is no negation, brackets
/// mean themselves, and a pattern that ends with /* does not match below the folders that it matches.
class CodeOwnersPattern {
public:
    /// @param text with backslashes before bytes that mean themselves.
    explicit CodeOwnersPattern(std::string_view text);

    /// Whether it matches a file. @param path relative to the root.
    bool matches(std::u16string_view path) const;

private:
    std::vector<project::session::Glob>
        globs_; ///< of the files themselves, and of those in folders that it matches
};

} // namespace projectctl
