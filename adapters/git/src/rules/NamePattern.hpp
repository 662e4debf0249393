#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace project::git {

/// What the lines of `.gitignore` and `.gitattributes` begin with (gitignore(5)): which names they are for.
class NamePattern {
public:
    /// Nothing for a text that no name can match.
    static std::optional<NamePattern> of(std::string_view text);

    /// @param path as seen from the folder of the file that the pattern stands in.
    bool matches(std::string_view path, bool isFolder, bool ignoresCase) const;

private:
    std::string text_;
    bool isForFolders_ = false;
    bool isPath_ = false; // else the last element is compared, in whatever folder
    bool hasWildcards_ = false;
};

} // namespace project::git
