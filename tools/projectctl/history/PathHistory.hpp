#pragma once

#include <string>
#include <vector>

#include "project/stores/DefinitionChange.hpp"

namespace projectctl {

/// One file or folder on its way back through the history, under all its earlier names.
class PathHistory {
public:
    /// @param path from the project's root.
    explicit PathHistory(std::u16string path) : path_(std::move(path)) {}

    /// The changes that concern the file, or the folder with everything below it. Afterwards, the object
    /// knows the name before these changes.
    std::vector<project::stores::DefinitionChange>
    takeFrom(std::vector<project::stores::DefinitionChange> const& changes);

private:
    bool isWithin(std::u16string const& path) const;

    std::u16string path_;
};

} // namespace projectctl
