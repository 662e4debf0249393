#pragma once

#include "project/core/ProjectReferenceManager.hpp"
#include "references/FolderReferenceManagerBase.hpp"

namespace project::management {

/// The references to other projects over a metadata store.
class ProjectReferenceManagerBase : public ProjectReferenceManager {
public:
    /// @param projectRoot where relative references lead from.
    ProjectReferenceManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager, Path projectRoot);

    FolderReferenceManager& getFolderReferenceManager() override;

private:
    FolderReferenceManagerBase references_;
};

} // namespace project::management
