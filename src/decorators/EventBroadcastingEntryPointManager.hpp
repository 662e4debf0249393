#pragma once

#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/EntryPointManagerDecorator.hpp"

namespace project::management {

/// Raises the same event after each change of an entry point or a group.
class EventBroadcastingEntryPointManager : public EntryPointManagerDecorator {
public:
    /// @param inner borrowed, as is the broadcaster; both must outlive this object.
    EventBroadcastingEntryPointManager(EntryPointManager& inner,
                                       DispatchableProjectEventBroadcaster& broadcaster);

    void setEntryPoint(EntryPoint& entryPoint) override;
    void removeEntryPoint(Path file) override;
    void deleteEntryPointGroup(EntryPointGroup const& group) override;
    void createEntryPointGroup(EntryPointGroup const& group) override;
    void renameEntryPointGroup(EntryPointGroup const& group, std::u16string const& newName) override;

private:
    DispatchableProjectEventBroadcaster& broadcaster_;
};

} // namespace project::management
