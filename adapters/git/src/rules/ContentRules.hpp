#pragma once

#include <string>
#include <unordered_map>

#include "repository/Repository.hpp"
#include "rules/AttributeRules.hpp"

namespace project::git {

/// What becomes of a file's content on its way into the repository.
struct Conversion {
    bool isNeeded; ///< whether libgit2 may have something to do: line ends, `$Id$`
    /// What git alone does, as in "the filter driver \"lfs\"": libgit2 runs no program for `filter=`, and
    /// knows no `working-tree-encoding=`. Empty when there is nothing.
    std::string foreign;
};

/// Tells from the attributes of files how their content is converted.
class ContentRules {
public:
    explicit ContentRules(Repository const& repository);

    /// @throws GitError when libgit2 can't tell the attributes that it goes by.
    Conversion conversionOf(TreePath const& path);

private:
    bool isConfigured(std::string const& driver);
    bool isKnownToLibGit(TreePath const& path, AttributeRules::Values const& values) const;

    Repository const& repository_;
    AttributeRules attributes_;
    bool areLineEndsConverted_;
    std::unordered_map<std::string, bool> drivers_;
};

} // namespace project::git
