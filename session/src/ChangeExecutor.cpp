#include "ChangeExecutor.hpp"

#include <exception>

#include "DefinitionStager.hpp"

namespace project::session {

using management::Path;

namespace {

/// Runs an action. @return its exception; null if it returned.
template <typename Action>
std::exception_ptr errorOf(Action const& action) {
    try {
        action();
        return nullptr;
    } catch (...) {
        return std::current_exception();
    }
}

} // namespace

ChangeExecutor::ChangeExecutor(metadata::MetadataManager& store, DefinitionStager* stager, EventQueue& raised,
                               std::shared_ptr<management::DispatchableProjectEventBroadcaster> observers)
    : store_(store), stager_(stager), raised_(raised), observers_(std::move(observers)) {
}

void ChangeExecutor::run(std::function<void()> const& operation, std::vector<Path> const& added) {
    std::vector<Event> events;
    std::exception_ptr changeError;
    {
        auto const guard = store_.acquireWriteLock();
        changeError = errorOf([&] {
            operation();
            stage(added);
        });
        events = raised_.take();
    }
    // Each event belongs to a write that is committed, so observers are called even after an error.
    auto const slotError = errorOf([&] { dispatch(events); });
    if (auto const& error = changeError ? changeError : slotError) {
        std::rethrow_exception(error);
    }
}

void ChangeExecutor::stage(std::vector<Path> const& added) {
    if (stager_ != nullptr) {
        if (!added.empty()) {
            stager_->stageReturned(added);
        }
        stager_->stageIfWritten();
    }
}

void ChangeExecutor::dispatch(std::vector<Event> const& events) {
    for (auto const& event : events) {
        event(*observers_);
    }
}

} // namespace project::session
