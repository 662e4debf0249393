#pragma once

#include <vector>

#include <boost/signals2/signal.hpp>

#include "project/decorators/ProjectEventBroadcaster.hpp"

namespace project::management {

/// The broadcaster that an application creates and shares with its project. Observers only need the base
/// class.
///
/// Each dispatching operation raises one event: it calls the connected slots on this thread and returns
/// after the last one has returned. An exception thrown by a slot propagates to the caller, and the
/// remaining slots are not called. All operations may be called from any thread, also from a slot. They
/// never take the store's lock.
///
/// A broadcaster does not refer to a project and may outlive it. Its destruction disconnects all slots.
class PROJECT_MANAGEMENT_EXPORT DispatchableProjectEventBroadcaster : public ProjectEventBroadcaster {
public:
    ~DispatchableProjectEventBroadcaster() override;

    Connection onFileListUpdate(FilesSlot const& slot) override;
    Connection onMetadataChange(Slot const& slot) override;
    Connection onLabelModified(LabelSlot const& slot) override;
    /// A category was deleted.
    Connection onCategoryDeleted(CategorySlot const& slot) override;
    Connection onCategoryAdded(CategorySlot const& slot) override;
    Connection onCategoryRenamed(CategorySlot const& slot) override;
    Connection onFileLabelsChanged(FilesSlot const& slot) override;
    Connection onEntryPointsChanged(Slot const& slot) override;
    Connection onNameChanged(Slot const& slot) override;
    Connection onPathChanged(Slot const& slot) override;
    Connection onReferencesChanged(Slot const& slot) override;

    /// Calls the slots of onFileListUpdate.
    void dispatchOnFileListUpdate(std::vector<Path> const& files);
    /// Calls the slots of onFileLabelsChanged.
    void dispatchFileLabelsChanged(std::vector<Path> const& files);

    /// Also for applications, to report changes of their own data.
    void dispatchMetadataChange();

    /// Calls the slots of onEntryPointsChanged.
    void dispatchEntryPointsChanged();
    /// Calls the slots of onNameChanged.
    void dispatchNameChanged();
    /// Calls the slots of onPathChanged.
    void dispatchPathChanged();
    /// Calls the slots of onReferencesChanged.
    void dispatchReferencesChanged();
    /// Calls the slots of onLabelModified.
    void dispatchLabelModified(Label const& label);
    /// Calls the slots of onCategoryDeleted.
    void dispatchCategoryDeleted(CategoryIdentifier const& category);
    /// Calls the slots of onCategoryAdded.
    void dispatchCategoryAdded(CategoryIdentifier const& category);
    /// Calls the slots of onCategoryRenamed.
    void dispatchCategoryRenamed(CategoryIdentifier const& category);

private:
    using Signal = boost::signals2::signal<void()>;
    using FilesSignal = boost::signals2::signal<void(std::vector<Path> const&)>;
    using LabelSignal = boost::signals2::signal<void(Label const&)>;
    using CategorySignal = boost::signals2::signal<void(CategoryIdentifier const&)>;

    FilesSignal fileListUpdate_;
    Signal metadataChange_;
    LabelSignal labelModified_;
    CategorySignal categoryDeleted_;
    CategorySignal categoryAdded_;
    CategorySignal categoryRenamed_;
    FilesSignal fileLabelsChanged_;
    Signal reservedChange_; // unused: a new kind of event can take its place without changing the layout
    Signal entryPointsChanged_;
    Signal nameChanged_;
    Signal pathChanged_;
    Signal referencesChanged_;
};

} // namespace project::management
