#include "references/ProjectPathManagerBase.hpp"

#include <utility>

#include "references/ProjectPathFolderReferenceCustomization.hpp"

namespace project::management {

ProjectPathManagerBase::ProjectPathManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager,
                                               Path projectRoot)
    : references_(std::make_unique<ProjectPathFolderReferenceCustomization>(projectRoot),
                  std::move(metadataManager), projectRoot) {
}

FolderReferenceManager& ProjectPathManagerBase::getFolderReferenceManager() {
    return references_;
}

} // namespace project::management
