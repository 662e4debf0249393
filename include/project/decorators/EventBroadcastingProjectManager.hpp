#pragma once

#include <memory>

#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/ProjectManagerDecorator.hpp"

namespace project::management {

/// Wraps a project so that the changes made through it raise events on a broadcaster.
///
/// An event is raised after its operation has succeeded, with the arguments of the operation. An operation
/// that throws raises none. If a slot throws, the change is kept, and the caller cannot distinguish this
/// from a change that failed. Threads that change the project at the same time may raise their events in a
/// different order from their changes.
///
/// The following raise no event: setDescription, create, FileManager::removeCategory, writes through
/// FileManager::getFileMetadataManagerFor, and changes that one manager makes for another, for instance
/// when a category is deleted and files lose its labels.
///
/// Deliberately two-level: the wrapped project is an InternalEventBroadcastingProjectManager, which has all
/// the state, so that this public class stays the same when the state changes.
class PROJECT_MANAGEMENT_EXPORT EventBroadcastingProjectManager : public ProjectManagerDecorator {
public:
    /// @param inner the project to wrap; owned by this object; not null.
    /// @param broadcaster shared with this object; not null.
    EventBroadcastingProjectManager(std::unique_ptr<ProjectManager> inner,
                                    std::shared_ptr<DispatchableProjectEventBroadcaster> broadcaster);
    ~EventBroadcastingProjectManager() override;
};

} // namespace project::management
