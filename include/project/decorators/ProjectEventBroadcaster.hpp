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

/// Tells observers what has changed in a project: one kind of event for each kind of change.
///
/// Slots of one event are called in the order in which they were connected, on the thread that made the
/// change, after the change and with no lock held, so that a slot may call any operation of the project. What
/// a slot throws reaches whoever made the change; the change stays, and the slots behind are not called.
///
/// Each operation here connects one slot and returns its connection, by which alone it can be disconnected.
/// All of them may be called from any thread, also while a slot runs; a slot that another thread is about to
/// call may still run once after it was disconnected.
class PROJECT_MANAGEMENT_EXPORT ProjectEventBroadcaster {
public:
    using Connection = boost::signals2::connection;
    using Slot = boost::signals2::slot<void()>;
    using FilesSlot = boost::signals2::slot<void(std::vector<Path> const&)>;
    using LabelSlot = boost::signals2::slot<void(Label const&)>;
    using CategorySlot = boost::signals2::slot<void(CategoryIdentifier const&)>;

    virtual ~ProjectEventBroadcaster();

    /// Files were added or removed. The slot gets the list that was given to FileManager::add or remove,
    /// which is not all that came or went with it.
    virtual Connection onFileListUpdate(FilesSlot const& slot) = 0;

    /// The application says that other data of the project changed: no operation of the library raises this.
    virtual Connection onMetadataChange(Slot const& slot) = 0;

    /// A label was created or deleted; the event does not tell which.
    virtual Connection onLabelModified(LabelSlot const& slot) = 0;

    virtual Connection onCategoryDeleted(CategorySlot const& slot) = 0;
    virtual Connection onCategoryAdded(CategorySlot const& slot) = 0;

    /// A category was renamed. The slot gets the category as it was given to LabelManager::renameCategory,
    /// with the old name.
    virtual Connection onCategoryRenamed(CategorySlot const& slot) = 0;

    /// Labels were put on these files or taken off them. A category or label that is deleted goes from its
    /// files without this event.
    virtual Connection onFileLabelsChanged(FilesSlot const& slot) = 0;

    /// Entry points or their groups changed.
    virtual Connection onEntryPointsChanged(Slot const& slot) = 0;

    /// The project was renamed by ProjectManager::setName; creating it raises nothing.
    virtual Connection onNameChanged(Slot const& slot) = 0;

    /// The project path changed.
    virtual Connection onPathChanged(Slot const& slot) = 0;

    /// The references to other projects changed.
    virtual Connection onReferencesChanged(Slot const& slot) = 0;
};

} // namespace project::management
