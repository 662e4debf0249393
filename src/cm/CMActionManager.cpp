#include "cm/CMActionManager.hpp"

#include "files/PathSets.hpp"

namespace project::management {

using cmlink::LocalStatus;

namespace {

/// The action of the first pass of each operation. The pass is only there for its query, which adapters
/// rely on.
void doNothing(std::vector<Path> const& /*files*/) {
}

bool isRemovalStaged(LocalStatus status) {
    return status == LocalStatus::RemovalStaged;
}

bool isAdded(LocalStatus status) {
    return status == LocalStatus::Added;
}

bool isToBeAdded(LocalStatus status) {
    return status == LocalStatus::NotUnderSourceControl;
}

/// Also true for numbers that only the adapter defines.
bool isToBeRemoved(LocalStatus status) {
    switch (status) {
    case LocalStatus::NotUnderSourceControl:
    case LocalStatus::Ignored:
    case LocalStatus::RemovalStaged:
    case LocalStatus::NotInRepository:
    case LocalStatus::Unknown:
        return false;
    default:
        return true;
    }
}

} // namespace

CMActionManager::CMActionManager(cmlink::CMAdapter& adapter) : adapter_(adapter) {
}

void CMActionManager::add(std::vector<Path> const& files, Path& root) {
    auto const all = withParentFolders(files, root);
    actOnFilesWithStatus(all, isRemovalStaged, doNothing);
    actOnFilesWithStatus(all, isToBeAdded,
                         [this](std::vector<Path> const& found) { adapter_.addToSourceControl(found); });
}

void CMActionManager::remove(std::vector<Path> const& files) {
    actOnFilesWithStatus(files, isAdded, doNothing);
    actOnFilesWithStatus(files, isToBeRemoved,
                         [this](std::vector<Path> const& found) { adapter_.removeFromSourceControl(found); });
}

void CMActionManager::actOnFilesWithStatus(std::vector<Path> const& files, Filter const& filter,
                                           Action const& action) {
    auto const states = adapter_.getFileStates(files);
    std::vector<Path> found;
    for (auto const& file : files) {
        auto const state = states.find(file);
        if (state != states.end() && filter(state->second.getState())) {
            found.push_back(file);
        }
    }
    if (!found.empty()) {
        action(found);
    }
}

} // namespace project::management
