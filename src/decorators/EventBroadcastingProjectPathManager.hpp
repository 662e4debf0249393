#pragma once

#include <memory>

#include "decorators/DispatchingFolderReferencManager.hpp"
#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/ProjectPathManagerDecorator.hpp"

namespace project::management {

/// Returns the project path as a list that raises an event after each change. Deliberately a class with one
/// getter: the interface that it wraps has one operation.
class EventBroadcastingProjectPathManager : public ProjectPathManagerDecorator {
public:
    /// Gets the list of the inner manager immediately.
    /// @param inner borrowed, as is the broadcaster; both must outlive this object.
    EventBroadcastingProjectPathManager(ProjectPathManager& inner,
                                        DispatchableProjectEventBroadcaster& broadcaster);

    FolderReferenceManager& getFolderReferenceManager() override;

private:
    struct Dispatch {
        DispatchableProjectEventBroadcaster& broadcaster;

        void operator()() const { broadcaster.dispatchPathChanged(); }
    };

    DispatchableProjectEventBroadcaster& broadcaster_;
    std::unique_ptr<DispatchingFolderReferencManager<Dispatch>> references_;
};

} // namespace project::management
