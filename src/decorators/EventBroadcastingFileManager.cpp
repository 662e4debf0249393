#include "decorators/EventBroadcastingFileManager.hpp"

#include "project/files/FileLabel.hpp"

namespace project::management {

EventBroadcastingFileManager::EventBroadcastingFileManager(FileManager& inner,
                                                           DispatchableProjectEventBroadcaster& broadcaster)
    : FileManagerDecorator(inner), broadcaster_(broadcaster) {
}

void EventBroadcastingFileManager::add(std::vector<Path> const& files) {
    FileManagerDecorator::add(files);
    broadcaster_.dispatchOnFileListUpdate(files);
}

std::vector<Path> EventBroadcastingFileManager::remove(std::vector<Path> const& files) {
    auto removed = FileManagerDecorator::remove(files);
    // As after add, the event contains the list that the caller passed. Observers find the rest in the
    // project.
    broadcaster_.dispatchOnFileListUpdate(files);
    return removed;
}

std::vector<FileLabel> EventBroadcastingFileManager::addLabels(std::vector<Path> const& files,
                                                               std::vector<Label> const& labels) {
    auto displaced = FileManagerDecorator::addLabels(files, labels);
    broadcaster_.dispatchFileLabelsChanged(files);
    return displaced;
}

void EventBroadcastingFileManager::removeLabels(std::vector<Path> const& files,
                                                std::vector<Label> const& labels) {
    FileManagerDecorator::removeLabels(files, labels);
    broadcaster_.dispatchFileLabelsChanged(files);
}

} // namespace project::management
