#pragma once

#include <string>
#include <unordered_map>

#include "Repository.hpp"

namespace project::git {

/// What becomes of a file's content on its way into the repository.
struct Conversion {
    bool isNeeded; ///< whether libgit2 may have something to do: line ends, `$Id$`
    /// What git alone does, as in "the filter driver \"lfs\"": libgit2 runs no program for `filter=`, and
    /// knows no `working-tree-encoding=`. Empty when there is nothing.
    std::string foreign;
};

/// Tells from the attributes of files (gitattributes(5)) how their content is converted.
///
/// All of a file's attributes are asked for at once: a question makes libgit2 look at every file of
/// attributes that could tell, and its own way of converting has three for each file.
class ContentRules {
public:
    explicit ContentRules(Repository const& repository);

    Conversion conversionOf(TreePath const& path);

private:
    bool isConfigured(std::string const& driver);

    Repository const& repository_;
    bool areLineEndsConverted_;
    std::unordered_map<std::string, bool> drivers_;
};

} // namespace project::git
