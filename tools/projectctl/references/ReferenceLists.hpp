#pragma once

#include <string>
#include <string_view>

#include "project/OpenProject.hpp"
#include "project/core/FolderReferenceManager.hpp"

namespace projectctl {

/// One of the two lists of folders that a project keeps, and how it is spoken of.
struct ReferenceList {
    project::management::FolderReferenceManager& (*manager)(OpenProject& project);
    std::u16string_view head; ///< type of the address that the store keeps it under
    std::string name;         ///< "the project path"
    bool isOfProjects; ///< of whole projects, kept relative or absolute; else of folders, kept relative
};

ReferenceList const& projectPath();
ReferenceList const& projectReferences();

/// A path without links and dots on the way, as far as it can be followed; as it is where it cannot.
Path followed(Path const& path);

} // namespace projectctl
