#include "references/ReferenceLists.hpp"

#include <utility>

#include "references/FolderReferenceCustomization.hpp"

namespace project::management {

ProjectPathManagerBase::ProjectPathManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager,
                                               Path projectRoot)
    : references_(std::make_unique<ProjectPathFolderReferenceCustomization>(projectRoot),
                  std::move(metadataManager), projectRoot) {
}

FolderReferenceManager& ProjectPathManagerBase::getFolderReferenceManager() {
    return references_;
}

ProjectReferenceManagerBase::ProjectReferenceManagerBase(
    std::shared_ptr<metadata::MetadataManager> metadataManager, Path projectRoot)
    : references_(std::make_unique<ProjectFolderReferenceCustomization>(projectRoot),
                  std::move(metadataManager), projectRoot) {
}

FolderReferenceManager& ProjectReferenceManagerBase::getFolderReferenceManager() {
    return references_;
}

} // namespace project::management
