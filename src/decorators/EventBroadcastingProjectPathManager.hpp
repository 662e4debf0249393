#pragma once

#include <memory>

#include "decorators/DispatchingFolderReferencManager.hpp"
#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/ProjectPathManagerDecorator.hpp"

namespace project::management {

/// Gives the project path as a list that raises an event after each change.
class EventBroadcastingProjectPathManager : public ProjectPathManagerDecorator {
public:
    /// Asks the inner manager for its list at once.
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
