#include "decorators/EventBroadcastingLabelManager.hpp"

#include "project/labels/Label.hpp"

namespace project::management {

EventBroadcastingLabelManager::EventBroadcastingLabelManager(LabelManager& inner,
                                                             DispatchableProjectEventBroadcaster& broadcaster)
    : LabelManagerDecorator(inner), broadcaster_(broadcaster) {
}

void EventBroadcastingLabelManager::createCategory(CategoryIdentifier const& category) {
    LabelManagerDecorator::createCategory(category);
    broadcaster_.dispatchCategoryAdded(category);
}

void EventBroadcastingLabelManager::deleteCategory(CategoryIdentifier const& category) {
    LabelManagerDecorator::deleteCategory(category);
    broadcaster_.dispatchCategoryDeleted(category);
}

void EventBroadcastingLabelManager::renameCategory(CategoryIdentifier const& category,
                                                   std::u16string const& newName) {
    LabelManagerDecorator::renameCategory(category, newName);
    broadcaster_.dispatchCategoryRenamed(category);
}

void EventBroadcastingLabelManager::createLabel(CategoryIdentifier const& category,
                                                LabelIdentifier const& label) {
    LabelManagerDecorator::createLabel(category, label);
    broadcaster_.dispatchLabelModified(Label(category, label));
}

void EventBroadcastingLabelManager::deleteLabel(CategoryIdentifier const& category,
                                                LabelIdentifier const& label) {
    LabelManagerDecorator::deleteLabel(category, label);
    broadcaster_.dispatchLabelModified(Label(category, label));
}

} // namespace project::management
