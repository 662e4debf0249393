#pragma once

#include "project/core/ProjectPathManager.hpp"
#include "project/core/ProjectReferenceManager.hpp"
#include "references/FolderReferenceManagerBase.hpp"

namespace project::management {

/// The project path over a metadata store. It has a class of its own, around one list, because the interface
/// does.
class ProjectPathManagerBase : public ProjectPathManager {
public:
    /// @param projectRoot the folder to which stored paths are relative, absolute and canonical.
    ProjectPathManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager, Path projectRoot);

    FolderReferenceManager& getFolderReferenceManager() override;

private:
    FolderReferenceManagerBase references_;
};

/// The references to other projects over a metadata store. They have a class of their own, around one list,
/// because the interface does.
class ProjectReferenceManagerBase : public ProjectReferenceManager {
public:
    /// @param projectRoot the folder to which stored paths are relative, absolute and canonical.
    ProjectReferenceManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager, Path projectRoot);

    FolderReferenceManager& getFolderReferenceManager() override;

private:
    FolderReferenceManagerBase references_;
};

} // namespace project::management
