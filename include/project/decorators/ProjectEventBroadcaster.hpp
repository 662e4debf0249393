#pragma once

#include <vector>

#include <boost/signals2/connection.hpp>
#include <boost/signals2/slot.hpp>

#include "fl/filesystem/Path.hpp"
#include "project/core/Export.hpp"

namespace project::management {

using fl::filesystem::Path;

class CategoryIdentifier;
class Label;

/// Reports changes of a project to observers, with one kind of event for each kind of change.
///
/// Events have two sources. A change made through EventBroadcastingProjectManager raises an event on the
/// thread that made the change, after it. Changes made by other programs are reported by project::session's
/// Session::refresh, on the thread that calls it, some time after they were made.
///
/// The slots of one event are called in the order in which they were connected, with no lock held, so a
/// slot may call any operation of the project. An exception thrown by a slot propagates to the caller that
/// made the change or called refresh. The change is kept, and the remaining slots are not called.
///
/// Each operation here connects one slot and returns its connection, which is the only means to disconnect
/// it. All operations may be called from any thread, also while a slot runs. A slot that another thread is
/// about to call may run once more after it was disconnected.
class PROJECT_MANAGEMENT_EXPORT ProjectEventBroadcaster {
public:
    /// A connected slot. Disconnecting it ends the calls.
    using Connection = boost::signals2::connection;
    /// A function without arguments.
    using Slot = boost::signals2::slot<void()>;
    /// A function that gets absolute paths.
    using FilesSlot = boost::signals2::slot<void(std::vector<Path> const&)>;
    /// A function that gets a label.
    using LabelSlot = boost::signals2::slot<void(Label const&)>;
    /// A function that gets a category.
    using CategorySlot = boost::signals2::slot<void(CategoryIdentifier const&)>;

    virtual ~ProjectEventBroadcaster();

    /// Files were added or removed. After FileManager::add or remove, the slot gets the list that the
    /// caller passed, without the folders and files that were added or removed with it. After a refresh, it
    /// gets every file and folder that was added or removed.
    virtual Connection onFileListUpdate(FilesSlot const& slot) = 0;

    /// Other data of the project changed. No manager raises this event. A refresh raises it for changes
    /// that have no event of their own, for instance of the description; an application may raise it for
    /// its own data.
    virtual Connection onMetadataChange(Slot const& slot) = 0;

    /// A label was created or deleted; the event does not say which.
    virtual Connection onLabelModified(LabelSlot const& slot) = 0;

    /// A category was deleted.
    virtual Connection onCategoryDeleted(CategorySlot const& slot) = 0;

    /// A category was created, or created again with other flags.
    virtual Connection onCategoryAdded(CategorySlot const& slot) = 0;

    /// A category was renamed. The slot gets the category with the old name: as the caller passed it to
    /// LabelManager::renameCategory, or as it was before the changes that a refresh reports.
    virtual Connection onCategoryRenamed(CategorySlot const& slot) = 0;

    /// Labels were put on these files or taken off them. When a manager deletes a category or label, the
    /// files lose it without this event; a refresh reports these files too.
    virtual Connection onFileLabelsChanged(FilesSlot const& slot) = 0;

    /// Entry points or their groups changed.
    virtual Connection onEntryPointsChanged(Slot const& slot) = 0;

    /// The project was renamed. ProjectManager::create does not raise this event; a refresh does if the
    /// name differs.
    virtual Connection onNameChanged(Slot const& slot) = 0;

    /// The project path changed.
    virtual Connection onPathChanged(Slot const& slot) = 0;

    /// The references to other projects changed.
    virtual Connection onReferencesChanged(Slot const& slot) = 0;
};

} // namespace project::management
