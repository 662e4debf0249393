#pragma once

#include <memory>

#include "decorators/DispatchingFolderReferencManager.hpp"
#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/ProjectReferenceManagerDecorator.hpp"

namespace project::management {

/// Returns the references to other projects as a list that raises an event after each change. Deliberately
/// a class with one getter: the interface that it wraps has one operation.
class EventBroadcastingProjectReferenceManager : public ProjectReferenceManagerDecorator {
public:
    /// Gets the list of the inner manager immediately.
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
