#include "references/ProjectReferenceManagerBase.hpp"

#include <utility>

#include "references/ProjectFolderReferenceCustomization.hpp"

namespace project::management {

ProjectReferenceManagerBase::ProjectReferenceManagerBase(
    std::shared_ptr<metadata::MetadataManager> metadataManager, Path projectRoot)
    : references_(std::make_unique<ProjectFolderReferenceCustomization>(projectRoot),
                  std::move(metadataManager), projectRoot) {
}

FolderReferenceManager& ProjectReferenceManagerBase::getFolderReferenceManager() {
    return references_;
}

} // namespace project::management
