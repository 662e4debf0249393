#pragma once

#include <deque>
#include <memory>
#include <mutex>
#include <optional>

#include "ChangeEvents.hpp"

namespace project::session {

/// The events for the changes that others have made to a store, until they are dispatched. May be used by
/// several threads.
class OthersEvents {
public:
    /// @param root of the project. Nothing is read here.
    OthersEvents(std::shared_ptr<stores::TreeMetadataManager> store, management::Path root,
                 FileEvents fileEvents);

    /// Checks for changes and dispatches the events for them, with no lock held. An event whose slot throws
    /// is not dispatched again; the remaining ones are, by the next call. Takes the store's read lock.
    /// @return false if there were none.
    bool dispatch(management::DispatchableProjectEventBroadcaster& observers);

private:
    void queue();
    std::optional<Event> next();

    std::shared_ptr<stores::TreeMetadataManager> const store_;
    management::Path const root_;
    FileEvents const fileEvents_;
    std::mutex mutex_;
    std::deque<Event> events_;
};

} // namespace project::session
