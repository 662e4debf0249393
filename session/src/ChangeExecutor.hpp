#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <type_traits>
#include <utility>
#include <vector>

#include "EventQueue.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::session {

class DefinitionStager;

/// Runs every change that an application makes through a session:
///
/// 1. It takes the store's write guard.
/// 2. It runs the operation. The managers note paths for source control, write the store and raise events,
///    which the event queue collects.
/// 3. It stages the text, if the session stages each change.
/// 4. It releases the guard and dispatches the events.
/// 5. If the operation or staging failed, it throws the error.
///
/// A manager raises an event after it has committed the write that the event reports. The events of an
/// operation that throws therefore report writes that remain, and are dispatched too; an operation that
/// throws before it writes has none. In both cases the queue is empty afterwards.
///
/// The guard covers steps 2 and 3 because the store notifies its listeners of every write: without it, the
/// write of another thread would stage, or remove from git's index, paths of an operation that has not
/// happened yet.
class ChangeExecutor {
public:
    /// @param store borrowed, as are the stager and the queue.
    /// @param stager null if the text is not staged after each change.
    /// @param raised the queue of the events that the managers raise.
    /// @param observers the broadcaster to dispatch these events on.
    ChangeExecutor(metadata::MetadataManager& store, DefinitionStager* stager, EventQueue& raised,
                   std::shared_ptr<management::DispatchableProjectEventBroadcaster> observers);

    /// @param added the files that the operation adds to the project.
    /// @return the result of the operation.
    /// @throws the operation's exception, and then stages nothing: the next change stages the text; else
    ///         the error of staging; else the exception of a slot.
    template <typename Operation>
    auto execute(Operation const& operation, std::vector<management::Path> const& added = {}) {
        if constexpr (std::is_void_v<decltype(operation())>) {
            run(operation, added);
        } else {
            std::optional<decltype(operation())> result;
            run([&] { result = operation(); }, added);
            return *std::move(result);
        }
    }

private:
    void run(std::function<void()> const& operation, std::vector<management::Path> const& added);
    void stage(std::vector<management::Path> const& added);
    void dispatch(std::vector<Event> const& events);

    metadata::MetadataManager& store_;
    DefinitionStager* stager_;
    EventQueue& raised_;
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> observers_;
};

} // namespace project::session
