#pragma once

#include <memory>

#include "decorators/DispatchingFolderReferencManager.hpp"
#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/ProjectReferenceManagerDecorator.hpp"

namespace project::management {

/// Gives the references to other projects as a list that raises an event after each change.
class EventBroadcastingProjectReferenceManager : public ProjectReferenceManagerDecorator {
public:
    /// Asks the inner manager for its list at once.
    /// @param inner borrowed, as is the broadcaster; both must outlive this object.
    EventBroadcastingProjectReferenceManager(ProjectReferenceManager& inner,
                                             DispatchableProjectEventBroadcaster& broadcaster);

    FolderReferenceManager& getFolderReferenceManager() override;

private:
    struct Dispatch {
        DispatchableProjectEventBroadcaster& broadcaster;

        void operator()() const { broadcaster.dispatchReferencesChanged(); }
    };

    DispatchableProjectEventBroadcaster& broadcaster_;
    std::unique_ptr<DispatchingFolderReferencManager<Dispatch>> references_;
};

} // namespace project::management
