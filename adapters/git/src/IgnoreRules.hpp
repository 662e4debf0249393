#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "Repository.hpp"

namespace project::git {

/// One line of a `.gitignore`.
class IgnorePattern {
public:
    /// Nothing for a line without a pattern.
    static std::optional<IgnorePattern> read(std::string_view line);

    /// @param path as seen from the folder of the file that the line stands in.
    bool matches(std::string_view path, bool isFolder, bool ignoresCase) const;

    /// Whether what matches is taken in again.
    bool isNegative() const { return isNegative_; }

private:
    std::string text_;
    bool isNegative_ = false;
    bool isForFolders_ = false;
    bool isPath_ = false; // else the last element is compared, in whatever folder
    bool hasWildcards_ = false;
};

/// The rules of a repository that tell which files are ignored (gitignore(5)): those of the folders, of
/// `info/exclude` and of `core.excludesFile`. Each file of rules is read once.
///
/// libgit2 has these rules too, but drops a line that takes back what another file ignores (its issue 7284),
/// and looks at every file of rules again for each question.
class IgnoreRules {
public:
    explicit IgnoreRules(Repository const& repository);

    /// Whether a rule ignores a path whose folders are not ignored.
    bool ignore(TreePath const& path, bool isFolder);

private:
    using Patterns = std::vector<IgnorePattern>;

    Patterns const& ofFolder(TreePath const& folder);
    std::optional<bool> decide(Patterns const& patterns, std::string_view path, bool isFolder) const;

    Repository const& repository_;
    bool ignoresCase_;
    std::vector<Patterns> general_; // the first counts before the others
    std::unordered_map<TreePath, Patterns> folders_;
};

} // namespace project::git
