#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "repository/Repository.hpp"
#include "rules/NamePattern.hpp"

namespace project::git {

/// One line of a `.gitignore`.
struct IgnoreLine {
    /// Nothing for a line without a pattern.
    static std::optional<IgnoreLine> read(std::string_view line);

    NamePattern pattern;
    bool isNegative; ///< whether matching files are not ignored after all
};

/// The rules that determine which files a repository ignores (gitignore(5)): those of the folders, of
/// `info/exclude` and of `core.excludesFile`. Each file of rules is read once.
///
/// libgit2's own implementation drops a negative line for files that another file ignores (its issue 7284),
/// and checks every file of rules again for each query.
class IgnoreRules {
public:
    explicit IgnoreRules(Repository const& repository);

    /// Whether a rule ignores a path whose folders are not ignored.
    bool isIgnored(TreePath const& path, bool isFolder);

private:
    using Lines = std::vector<IgnoreLine>;

    Lines const& ofFolder(TreePath const& folder);
    std::optional<bool> decide(Lines const& lines, std::string_view path, bool isFolder) const;

    Repository const& repository_;
    bool isCaseIgnored_;
    std::vector<Lines> general_; // in order of precedence
    std::unordered_map<TreePath, Lines> folders_;
};

} // namespace project::git
