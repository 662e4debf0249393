#include "decorators/InternalEventBroadcastingProjectManager.hpp"

#include <utility>

namespace project::management {

InternalEventBroadcastingProjectManager::InternalEventBroadcastingProjectManager(
    std::unique_ptr<ProjectManager> inner, std::shared_ptr<DispatchableProjectEventBroadcaster> broadcaster)
    : ProjectManagerDecorator(std::move(inner)),
      broadcaster_(std::move(broadcaster)),
      fileManager_(ProjectManagerDecorator::getFileManager(), *broadcaster_),
      labelManager_(ProjectManagerDecorator::getLabelManager(), *broadcaster_),
      entryPointManager_(ProjectManagerDecorator::getEntryPointManager(), *broadcaster_),
      projectPathManager_(ProjectManagerDecorator::getProjectPathManager(), *broadcaster_),
      projectReferenceManager_(ProjectManagerDecorator::getProjectReferenceManager(), *broadcaster_) {
}

EntryPointManager& InternalEventBroadcastingProjectManager::getEntryPointManager() {
    return entryPointManager_;
}

FileManager& InternalEventBroadcastingProjectManager::getFileManager() {
    return fileManager_;
}

LabelManager& InternalEventBroadcastingProjectManager::getLabelManager() {
    return labelManager_;
}

ProjectReferenceManager& InternalEventBroadcastingProjectManager::getProjectReferenceManager() {
    return projectReferenceManager_;
}

ProjectPathManager& InternalEventBroadcastingProjectManager::getProjectPathManager() {
    return projectPathManager_;
}

void InternalEventBroadcastingProjectManager::setName(std::u16string const& name) {
    ProjectManagerDecorator::setName(name);
    broadcaster_->dispatchNameChanged();
}

} // namespace project::management
