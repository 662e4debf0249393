#include "StagingProjectManager.hpp"

#include <utility>

namespace project::session {

StagingProjectManager::StagingProjectManager(std::unique_ptr<management::ProjectManager> inner,
                                             DefinitionStager& stager)
    : ProjectManagerDecorator(std::move(inner)),
      stager_(stager),
      files_(ProjectManagerDecorator::getFileManager(), stager),
      labels_(ProjectManagerDecorator::getLabelManager(), stager),
      entryPoints_(ProjectManagerDecorator::getEntryPointManager(), stager),
      projectPath_(ProjectManagerDecorator::getProjectPathManager(), stager),
      references_(ProjectManagerDecorator::getProjectReferenceManager(), stager) {
}

management::EntryPointManager& StagingProjectManager::getEntryPointManager() {
    return entryPoints_;
}

management::FileManager& StagingProjectManager::getFileManager() {
    return files_;
}

management::LabelManager& StagingProjectManager::getLabelManager() {
    return labels_;
}

management::ProjectReferenceManager& StagingProjectManager::getProjectReferenceManager() {
    return references_;
}

management::ProjectPathManager& StagingProjectManager::getProjectPathManager() {
    return projectPath_;
}

void StagingProjectManager::setName(std::u16string const& name) {
    stager_.after([&] { ProjectManagerDecorator::setName(name); });
}

void StagingProjectManager::setDescription(std::u16string const& description) {
    stager_.after([&] { ProjectManagerDecorator::setDescription(description); });
}

void StagingProjectManager::create(std::u16string const& name) {
    stager_.after([&] { ProjectManagerDecorator::create(name); });
}

} // namespace project::session
