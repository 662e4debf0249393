#pragma once

#include "project/core/ProjectPathManager.hpp"
#include "references/FolderReferenceManagerBase.hpp"

namespace project::management {

/// The project path over a metadata store.
class ProjectPathManagerBase : public ProjectPathManager {
public:
    /// @param projectRoot where relative references lead from.
    ProjectPathManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager, Path projectRoot);

    FolderReferenceManager& getFolderReferenceManager() override;

private:
    FolderReferenceManagerBase references_;
};

} // namespace project::management
