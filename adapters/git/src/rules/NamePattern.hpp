#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace project::git {

/// The pattern at the beginning of a line of `.gitignore` or `.gitattributes` (gitignore(5)).
class NamePattern {
public:
    /// Nothing for a text that cannot match any name.
    static std::optional<NamePattern> of(std::string_view text);

    /// @param path relative to the folder of the file that contains the pattern.
    bool isMatch(std::string_view path, bool isFolder, bool isCaseIgnored) const;

private:
    std::string text_;
    bool isForFolders_ = false;
    bool isPath_ = false; // else only the last element is compared
    bool hasWildcards_ = false;
};

} // namespace project::git
