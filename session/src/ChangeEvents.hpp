#pragma once

#include <memory>
#include <vector>

#include "EventQueue.hpp"
#include "project/management.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// The events that changes of the file list raise.
enum class FileEvents {
    All,
    LabelsOnly, ///< the list itself says nothing: it contains the files that have labels
};

/// The events for changes that other processes, git or an editor made to the project. They are the same as
/// if the managers here had made the changes: one for all files that were added or removed, one for all
/// files whose labels changed, one for each category and label, one each for the entry points with their
/// groups, the project path, the references and the name, and metadataChange for everything else. Removed
/// categories and labels are reported as they were.
///
/// Call it under a guard of the store, so that the project is as the changes have left it.
/// @param store the project's store. @param root the project's root, absolute.
std::vector<Event> eventsOf(stores::Changes const& changes,
                            std::shared_ptr<metadata::MetadataManager> const& store,
                            management::Path const& root, FileEvents fileEvents = FileEvents::All);

} // namespace project::session
