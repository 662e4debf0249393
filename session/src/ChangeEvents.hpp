#pragma once

#include <functional>
#include <vector>

#include "project/management.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// An event that is still to be dispatched.
using Event = std::function<void(management::DispatchableProjectEventBroadcaster&)>;

/// The events that tell what others have changed in a project, such as they would be if the managers here had
/// made the changes: each file that came or went, or whose labels changed; each category and label; one event
/// each for the entry points with their groups, the project path, the references and the name; and
/// metadataChange for everything else. What went is told as it was.
///
/// To be called under a guard of the store, so that the project is as the changes have left it.
/// @param store the project's. @param root the project's root, absolute.
std::vector<Event> eventsOf(stores::Changes const& changes,
                            std::shared_ptr<metadata::MetadataManager> const& store,
                            management::Path const& root);

} // namespace project::session
