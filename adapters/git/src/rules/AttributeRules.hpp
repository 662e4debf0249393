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

/// The attributes of files, as git determines them for staging (gitattributes(5)): from the repository's
/// `info/attributes`, the folders from the file's upwards, `core.attributesFile`, and the system's file. Each
/// file of attributes is read once.
///
/// libgit2's own implementation ignores patterns in quotes, treats unset macros as set, and does not know
/// macros of other files. It would stage a file with a filter driver without the filter.
class AttributeRules {
public:
    using Values = std::map<std::string, AttributeValue, std::less<>>;

    explicit AttributeRules(Repository const& repository);

    /// All attributes of a file, including macros.
    Values of(TreePath const& path);

private:
    using Lines = std::vector<AttributeLine>;
    using States = std::vector<AttributeState>;

    Lines const& ofFolder(TreePath const& folder);
    void defineMacros(Lines const& lines);
    void applyMatching(Lines const& lines, std::string_view path, Values& values) const;
    void apply(States const& states, Values& values) const;

    Repository const& repository_;
    bool isCaseIgnored_;
    Lines own_;
    std::vector<Lines> general_; // in order of precedence
    std::unordered_map<TreePath, Lines> folders_;
    std::map<std::string, States, std::less<>> macros_;
};

} // namespace project::git
