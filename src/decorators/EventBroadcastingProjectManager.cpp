#include "project/decorators/EventBroadcastingProjectManager.hpp"

#include <utility>

#include "decorators/InternalEventBroadcastingProjectManager.hpp"

namespace project::management {

EventBroadcastingProjectManager::EventBroadcastingProjectManager(
    std::unique_ptr<ProjectManager> inner, std::shared_ptr<DispatchableProjectEventBroadcaster> broadcaster)
    : ProjectManagerDecorator(std::make_unique<InternalEventBroadcastingProjectManager>(
          std::move(inner), std::move(broadcaster))) {
}

EventBroadcastingProjectManager::~EventBroadcastingProjectManager() = default;

} // namespace project::management
