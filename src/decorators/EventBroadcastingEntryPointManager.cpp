#include "decorators/EventBroadcastingEntryPointManager.hpp"

#include <utility>

namespace project::management {

EventBroadcastingEntryPointManager::EventBroadcastingEntryPointManager(
    EntryPointManager& inner, DispatchableProjectEventBroadcaster& broadcaster)
    : EntryPointManagerDecorator(inner), broadcaster_(broadcaster) {
}

void EventBroadcastingEntryPointManager::setEntryPoint(EntryPoint& entryPoint) {
    EntryPointManagerDecorator::setEntryPoint(entryPoint);
    broadcaster_.dispatchEntryPointsChanged();
}

void EventBroadcastingEntryPointManager::removeEntryPoint(Path file) {
    EntryPointManagerDecorator::removeEntryPoint(std::move(file));
    broadcaster_.dispatchEntryPointsChanged();
}

void EventBroadcastingEntryPointManager::deleteEntryPointGroup(EntryPointGroup const& group) {
    EntryPointManagerDecorator::deleteEntryPointGroup(group);
    broadcaster_.dispatchEntryPointsChanged();
}

void EventBroadcastingEntryPointManager::createEntryPointGroup(EntryPointGroup const& group) {
    EntryPointManagerDecorator::createEntryPointGroup(group);
    broadcaster_.dispatchEntryPointsChanged();
}

void EventBroadcastingEntryPointManager::renameEntryPointGroup(EntryPointGroup const& group,
                                                               std::u16string const& newName) {
    EntryPointManagerDecorator::renameEntryPointGroup(group, newName);
    broadcaster_.dispatchEntryPointsChanged();
}

} // namespace project::management
