#include "decorators/EventBroadcastingProjectReferenceManager.hpp"

namespace project::management {

EventBroadcastingProjectReferenceManager::EventBroadcastingProjectReferenceManager(
    ProjectReferenceManager& inner, DispatchableProjectEventBroadcaster& broadcaster)
    : ProjectReferenceManagerDecorator(inner),
      broadcaster_(broadcaster),
      references_(std::make_unique<DispatchingFolderReferencManager<Dispatch>>(
          inner.getFolderReferenceManager(), Dispatch{broadcaster_})) {
}

FolderReferenceManager& EventBroadcastingProjectReferenceManager::getFolderReferenceManager() {
    return *references_;
}

} // namespace project::management
