#include "project/session/ToolAccess.hpp"

#include "SessionState.hpp"

namespace project::session {

ToolAccess::ToolAccess(Session& session) noexcept : state_(*session.state_) {
}

stores::TextBackend& ToolAccess::text() noexcept {
    return *state_.text;
}

void ToolAccess::markTextForStaging() noexcept {
    if (state_.stager) {
        state_.stager->noteWritten();
    }
}

void ToolAccess::stageReturned(std::vector<Path> const& files) {
    if (state_.stager) {
        state_.stager->stageReturned(files);
    }
}

std::vector<Path> ToolAccess::trackedOutsideProject(std::vector<Path> const& folders) {
    std::vector<Path> result;
    if (state_.adapter) {
        auto const guard = state_.store->acquireWriteLock(); // only one thread at a time may use the adapter
        for (auto const& file : state_.adapter->trackedBelow(folders)) {
            if (!state_.project->getFileManager().isFileInProject(file)) {
                result.push_back(file);
            }
        }
    }
    return result;
}

} // namespace project::session
