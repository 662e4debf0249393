#include "OthersEvents.hpp"

#include <algorithm>
#include <iterator>
#include <utility>

namespace project::session {

OthersEvents::OthersEvents(std::shared_ptr<stores::TreeMetadataManager> store, management::Path root,
                           FileEvents fileEvents)
    : store_(std::move(store)), root_(std::move(root)), fileEvents_(fileEvents) {
}

bool OthersEvents::dispatch(management::DispatchableProjectEventBroadcaster& observers) {
    queue();
    bool hasDispatched = false;
    while (auto const event = next()) {
        hasDispatched = true;
        (*event)(observers);
    }
    return hasDispatched;
}

void OthersEvents::queue() {
    auto const guard = store_->acquireReadLock(); // the project stays as the changes have left it
    auto const changes = store_->takeOthersChanges();
    if (!changes.everything && changes.differences.empty()) {
        return;
    }
    auto found = eventsOf(changes, store_, root_, fileEvents_);
    std::lock_guard const lock(mutex_);
    std::move(found.begin(), found.end(), std::back_inserter(events_));
}

/// Removes the event before it is dispatched: an event whose slot throws is not dispatched twice.
std::optional<Event> OthersEvents::next() {
    std::lock_guard const lock(mutex_);
    if (events_.empty()) {
        return std::nullopt;
    }
    auto event = std::move(events_.front());
    events_.pop_front();
    return event;
}

} // namespace project::session
