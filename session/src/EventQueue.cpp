#include "EventQueue.hpp"

#include <utility>

#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/Label.hpp"

namespace project::session {

namespace {

using Broadcaster = management::DispatchableProjectEventBroadcaster;

/// A slot that appends the dispatching of its event, with a copy of the arguments.
template <typename... Arguments>
auto appendTo(std::vector<Event>& events, void (Broadcaster::*dispatch)(Arguments const&...)) {
    return [&events, dispatch](Arguments const&... arguments) {
        events.emplace_back(
            [dispatch, ... copies = arguments](Broadcaster& to) { (to.*dispatch)(copies...); });
    };
}

} // namespace

void dispatch(std::vector<Event> const& events, Broadcaster& observers) {
    for (auto const& event : events) {
        event(observers);
    }
}

EventQueue::EventQueue() : input_(std::make_shared<Broadcaster>()) {
    input_->onFileListUpdate(appendTo(events_, &Broadcaster::dispatchOnFileListUpdate));
    input_->onMetadataChange(appendTo(events_, &Broadcaster::dispatchMetadataChange));
    input_->onLabelModified(appendTo(events_, &Broadcaster::dispatchLabelModified));
    input_->onCategoryDeleted(appendTo(events_, &Broadcaster::dispatchCategoryDeleted));
    input_->onCategoryAdded(appendTo(events_, &Broadcaster::dispatchCategoryAdded));
    input_->onCategoryRenamed(appendTo(events_, &Broadcaster::dispatchCategoryRenamed));
    input_->onFileLabelsChanged(appendTo(events_, &Broadcaster::dispatchFileLabelsChanged));
    input_->onEntryPointsChanged(appendTo(events_, &Broadcaster::dispatchEntryPointsChanged));
    input_->onNameChanged(appendTo(events_, &Broadcaster::dispatchNameChanged));
    input_->onPathChanged(appendTo(events_, &Broadcaster::dispatchPathChanged));
    input_->onReferencesChanged(appendTo(events_, &Broadcaster::dispatchReferencesChanged));
}

void EventQueue::dropBehind(std::size_t count) noexcept {
    events_.erase(events_.begin() + static_cast<std::ptrdiff_t>(count), events_.end());
}

std::vector<Event> EventQueue::take() {
    return std::exchange(events_, {});
}

} // namespace project::session
