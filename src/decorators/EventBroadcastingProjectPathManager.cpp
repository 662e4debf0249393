#include "decorators/EventBroadcastingProjectPathManager.hpp"

namespace project::management {

EventBroadcastingProjectPathManager::EventBroadcastingProjectPathManager(
    ProjectPathManager& inner, DispatchableProjectEventBroadcaster& broadcaster)
    : ProjectPathManagerDecorator(inner),
      broadcaster_(broadcaster),
      references_(std::make_unique<DispatchingFolderReferencManager<Dispatch>>(
          inner.getFolderReferenceManager(), Dispatch{broadcaster_})) {
}

FolderReferenceManager& EventBroadcastingProjectPathManager::getFolderReferenceManager() {
    return *references_;
}

} // namespace project::management
