#pragma once

#include <string_view>

#include "project/OpenProject.hpp"
#include "project/core/FolderReferenceManager.hpp"

namespace projectctl {

/// One of the two lists of folders that a project stores.
struct ReferenceList {
    project::management::FolderReferenceManager& (*manager)(OpenProject& project);
    std::u16string_view head; ///< type of the first step of its addresses
    bool isOfProjects; ///< true: folders of projects, relative or absolute; false: folders, relative only
};

ReferenceList const& projectPath();
ReferenceList const& projectReferences();

/// A path without links and dots, as far as it can be followed; unchanged if it cannot be followed at all.
Path followed(Path const& path);

} // namespace projectctl
