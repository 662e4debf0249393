#pragma once

#include <functional>
#include <memory>
#include <utility>
#include <vector>

#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"

namespace project::session {

/// An event that is still to be dispatched.
using Event = std::function<void(management::DispatchableProjectEventBroadcaster&)>;

/// Dispatches events in their order. An exception of a slot ends it.
void dispatch(std::vector<Event> const& events, management::DispatchableProjectEventBroadcaster& observers);

/// Collects the events that the managers raise, so that they can be dispatched when no lock is held.
///
/// It has no lock of its own: events are raised and taken under the store's write guard.
class EventQueue {
public:
    EventQueue();
    EventQueue(EventQueue const&) = delete;
    EventQueue& operator=(EventQueue const&) = delete;

    /// The broadcaster on which the managers raise their events. This object must outlive the last event.
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> const& input() const noexcept {
        return input_;
    }

    /// The number of events that are waiting.
    std::size_t size() const noexcept { return events_.size(); }

    /// Adds an event that no manager raises.
    void push(Event event) { events_.push_back(std::move(event)); }

    /// Removes all events but the first ones: what they report was rolled back.
    /// @param count the number of events to keep, at most size().
    void dropBehind(std::size_t count) noexcept;

    /// Removes and returns all events, in the order in which they were raised.
    std::vector<Event> take();

private:
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> input_;
    std::vector<Event> events_;
};

} // namespace project::session
