#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"

namespace project::management {

ProjectEventBroadcaster::~ProjectEventBroadcaster() = default;
DispatchableProjectEventBroadcaster::~DispatchableProjectEventBroadcaster() = default;

ProjectEventBroadcaster::Connection
DispatchableProjectEventBroadcaster::onFileListUpdate(FilesSlot const& slot) {
    return fileListUpdate_.connect(slot);
}

ProjectEventBroadcaster::Connection DispatchableProjectEventBroadcaster::onMetadataChange(Slot const& slot) {
    return metadataChange_.connect(slot);
}

ProjectEventBroadcaster::Connection
DispatchableProjectEventBroadcaster::onLabelModified(LabelSlot const& slot) {
    return labelModified_.connect(slot);
}

ProjectEventBroadcaster::Connection
DispatchableProjectEventBroadcaster::onCategoryDeleted(CategorySlot const& slot) {
    return categoryDeleted_.connect(slot);
}

ProjectEventBroadcaster::Connection
DispatchableProjectEventBroadcaster::onCategoryAdded(CategorySlot const& slot) {
    return categoryAdded_.connect(slot);
}

ProjectEventBroadcaster::Connection
DispatchableProjectEventBroadcaster::onCategoryRenamed(CategorySlot const& slot) {
    return categoryRenamed_.connect(slot);
}

ProjectEventBroadcaster::Connection
DispatchableProjectEventBroadcaster::onFileLabelsChanged(FilesSlot const& slot) {
    return fileLabelsChanged_.connect(slot);
}

ProjectEventBroadcaster::Connection
DispatchableProjectEventBroadcaster::onEntryPointsChanged(Slot const& slot) {
    return entryPointsChanged_.connect(slot);
}

ProjectEventBroadcaster::Connection DispatchableProjectEventBroadcaster::onNameChanged(Slot const& slot) {
    return nameChanged_.connect(slot);
}

ProjectEventBroadcaster::Connection DispatchableProjectEventBroadcaster::onPathChanged(Slot const& slot) {
    return pathChanged_.connect(slot);
}

ProjectEventBroadcaster::Connection
DispatchableProjectEventBroadcaster::onReferencesChanged(Slot const& slot) {
    return referencesChanged_.connect(slot);
}

void DispatchableProjectEventBroadcaster::dispatchOnFileListUpdate(std::vector<Path> const& files) {
    fileListUpdate_(files);
}

void DispatchableProjectEventBroadcaster::dispatchFileLabelsChanged(std::vector<Path> const& files) {
    fileLabelsChanged_(files);
}

void DispatchableProjectEventBroadcaster::dispatchMetadataChange() {
    metadataChange_();
}

void DispatchableProjectEventBroadcaster::dispatchEntryPointsChanged() {
    entryPointsChanged_();
}

void DispatchableProjectEventBroadcaster::dispatchNameChanged() {
    nameChanged_();
}

void DispatchableProjectEventBroadcaster::dispatchPathChanged() {
    pathChanged_();
}

void DispatchableProjectEventBroadcaster::dispatchReferencesChanged() {
    referencesChanged_();
}

void DispatchableProjectEventBroadcaster::dispatchLabelModified(Label const& label) {
    labelModified_(label);
}

void DispatchableProjectEventBroadcaster::dispatchCategoryDeleted(CategoryIdentifier const& category) {
    categoryDeleted_(category);
}

void DispatchableProjectEventBroadcaster::dispatchCategoryAdded(CategoryIdentifier const& category) {
    categoryAdded_(category);
}

void DispatchableProjectEventBroadcaster::dispatchCategoryRenamed(CategoryIdentifier const& category) {
    categoryRenamed_(category);
}

} // namespace project::management
