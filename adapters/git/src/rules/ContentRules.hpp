#pragma once

#include <string>
#include <unordered_map>

#include "repository/Repository.hpp"
#include "rules/AttributeRules.hpp"

namespace project::git {

/// The conversion of a file's content when it is staged.
struct Conversion {
    bool isNeeded; ///< whether libgit2 may have to convert line ends or `$Id$`
    /// A conversion that only git does, for example "the filter driver \"lfs\"": libgit2 does not run
    /// programs for `filter=`, and does not know `working-tree-encoding=`. Empty if there is none.
    std::string foreign;
};

/// Determines from the attributes of files how their content is converted.
class ContentRules {
public:
    explicit ContentRules(Repository const& repository);

    /// @throws GitError if libgit2 cannot read the attributes that it converts by.
    Conversion conversionOf(TreePath const& path);

private:
    bool isConfigured(std::string const& driver);
    bool isKnownToLibGit(TreePath const& path, AttributeRules::Values const& values) const;

    Repository const& repository_;
    AttributeRules attributes_;
    bool hasConvertedLineEnds_;
    std::unordered_map<std::string, bool> drivers_;
};

} // namespace project::git
