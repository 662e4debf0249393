#pragma once

#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "repository/Repository.hpp"
#include "rules/AttributeLine.hpp"

namespace project::git {

/// The attributes of files, as git finds them for what is staged (gitattributes(5)): in the repository's
/// `info/attributes`, the folders from the file's upwards, `core.attributesFile`, and the system's file. Each
/// file of attributes is read once.
///
/// libgit2 has them too, but passes over patterns in quotes, takes macros that are unset for set, and doesn't
/// know those of other files: a file with a filter driver would be staged as it stands.
class AttributeRules {
public:
    using Values = std::map<std::string, AttributeValue, std::less<>>;

    explicit AttributeRules(Repository const& repository);

    /// Every attribute that any line gives the file, macros included.
    Values of(TreePath const& path);

private:
    using Lines = std::vector<AttributeLine>;
    using States = std::vector<AttributeState>;

    Lines const& ofFolder(TreePath const& folder);
    void defineMacros(Lines const& lines);
    void applyMatching(Lines const& lines, std::string_view path, Values& values) const;
    void apply(States const& states, Values& values) const;

    Repository const& repository_;
    bool ignoresCase_;
    Lines own_;
    std::vector<Lines> general_; // the first counts before the others
    std::unordered_map<TreePath, Lines> folders_;
    std::map<std::string, States, std::less<>> macros_;
};

} // namespace project::git
