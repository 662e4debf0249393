#pragma once

#include <memory>

#include "decorators/EventBroadcastingEntryPointManager.hpp"
#include "decorators/EventBroadcastingFileManager.hpp"
#include "decorators/EventBroadcastingLabelManager.hpp"
#include "decorators/EventBroadcastingProjectPathManager.hpp"
#include "decorators/EventBroadcastingProjectReferenceManager.hpp"
#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/ProjectManagerDecorator.hpp"

namespace project::management {

/// The state of EventBroadcastingProjectManager: the project and the decorators of its managers.
///
/// Deliberately a class of its own: it can change without changing the public class. The base class must
/// own the project before the decorators of its managers are created.
class InternalEventBroadcastingProjectManager : public ProjectManagerDecorator {
public:
    InternalEventBroadcastingProjectManager(std::unique_ptr<ProjectManager> inner,
                                            std::shared_ptr<DispatchableProjectEventBroadcaster> broadcaster);

    EntryPointManager& getEntryPointManager() override;
    FileManager& getFileManager() override;
    LabelManager& getLabelManager() override;
    ProjectReferenceManager& getProjectReferenceManager() override;
    ProjectPathManager& getProjectPathManager() override;
    void setName(std::u16string const& name) override;

private:
    std::shared_ptr<DispatchableProjectEventBroadcaster> broadcaster_; // first: the others refer to it
    EventBroadcastingFileManager fileManager_;
    EventBroadcastingLabelManager labelManager_;
    EventBroadcastingEntryPointManager entryPointManager_;
    EventBroadcastingProjectPathManager projectPathManager_;
    EventBroadcastingProjectReferenceManager projectReferenceManager_;
};

} // namespace project::management
