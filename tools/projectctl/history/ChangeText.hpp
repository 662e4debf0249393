#pragma once

#include <string>
#include <vector>

#include "cli/ShownPaths.hpp"
#include "project/stores/DefinitionChange.hpp"

namespace projectctl {

/// Writes changes between two versions of a definition to standard output, one per line, with the words that
/// the changes of a dry run have, and these:
///
///     rename OLD NEW              change PATH (its data)       change CATEGORY=LABEL PATH (the label's data)
///     category change NAME        the same with label, entry and group
///     path rename OLD NEW         the same with reference and entry
///
/// The settings of something new, and those that changed, follow as KEY=VALUE. Files that moved with their
/// folder have no line.
class ChangeText {
public:
    /// @param indent before each line.
    ChangeText(ShownPaths shown, std::string indent) : shown_(std::move(shown)), indent_(std::move(indent)) {}

    void write(std::vector<project::stores::DefinitionChange> const& changes);

private:
    using Change = project::stores::DefinitionChange;

    void write(Change const& change);
    std::string subjectOf(Change const& change);
    std::string pathText(std::u16string_view path);

    ShownPaths shown_;
    std::string indent_;
};

} // namespace projectctl
