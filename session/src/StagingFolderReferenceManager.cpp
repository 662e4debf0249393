#include "StagingFolderReferenceManager.hpp"

namespace project::session {

StagingFolderReferenceManager::StagingFolderReferenceManager(management::FolderReferenceManager& inner,
                                                             DefinitionStager& stager)
    : FolderReferenceManagerDecorator(inner), stager_(stager) {
}

void StagingFolderReferenceManager::addReferences(
    std::vector<management::FolderReference> const& references) {
    stager_.after([&] { FolderReferenceManagerDecorator::addReferences(references); });
}

void StagingFolderReferenceManager::removeReferences(
    std::vector<management::FolderReference> const& references) {
    stager_.after([&] { FolderReferenceManagerDecorator::removeReferences(references); });
}

} // namespace project::session
