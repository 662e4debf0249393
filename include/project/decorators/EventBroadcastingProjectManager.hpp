#pragma once

#include <memory>

#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/ProjectManagerDecorator.hpp"

namespace project::management {

/// Wraps a project so that the changes made through it raise events on a broadcaster.
///
/// An event comes after its operation has succeeded, with the arguments that the operation was given; an
/// operation that throws raises none. When a slot throws, the change stays all the same, and a caller can't
/// tell that from a change that failed. Threads that change the project at once may raise their events in
/// another order than they made their changes.
///
/// These raise nothing: setDescription and create, FileManager::removeCategory, what is written through
/// FileManager::getFileMetadataManagerFor, and what managers change in one another, such as the labels that
/// go from files with their category.
class PROJECT_MANAGEMENT_EXPORT EventBroadcastingProjectManager : public ProjectManagerDecorator {
public:
    /// @param inner the project to wrap, which goes with this object; not null.
    /// @param broadcaster kept for as long as this object lives; not null.
    EventBroadcastingProjectManager(std::unique_ptr<ProjectManager> inner,
                                    std::shared_ptr<DispatchableProjectEventBroadcaster> broadcaster);
    ~EventBroadcastingProjectManager() override;
};

} // namespace project::management
