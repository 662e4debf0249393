#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace projectctl {

/// The names in a path, from the root.
std::vector<std::string_view> namesIn(std::string_view path);

/// A pattern of a CODEOWNERS file: one of .gitignore, with these differences: there is no negation, brackets
/// mean themselves, and a pattern that ends with /* does not match below the folders that it matches.
class CodeOwnersPattern {
public:
    /// @param text with backslashes before bytes that mean themselves.
    explicit CodeOwnersPattern(std::string_view text);

    /// Whether it matches a file. @param path its names, from the root.
    bool matches(std::vector<std::string_view> const& path) const { return matchesFrom(0, path, 0); }

private:
    bool matchesFrom(std::size_t name, std::vector<std::string_view> const& path, std::size_t at) const;

    std::vector<std::string> names_; ///< "**" is any number of folders
    bool isOfFolders_;               ///< matches folders only, and so everything below them
    bool matchesBelow_;              ///< a folder that matches includes everything below it
};

} // namespace projectctl
