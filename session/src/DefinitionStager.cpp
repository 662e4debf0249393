#include "DefinitionStager.hpp"

#include <algorithm>
#include <atomic>
#include <utility>

#include "project/metadata/FileChangeRequestListener.hpp"

namespace project::session {

using cmlink::LocalStatus;

/// Remembers that the store was written. The files that the write created or deleted do not matter here.
class DefinitionStager::WriteWatch : public metadata::FileChangeRequestListener {
public:
    void fileRemovalRequested(metadata::MetadataManager& /*store*/, Path const& /*metadataRoot*/,
                              std::vector<Path> const& /*files*/) override {
        hasWritten = true;
    }

    void fileAdditionRequested(metadata::MetadataManager& /*store*/,
                               std::vector<Path> const& /*files*/) override {
        hasWritten = true;
    }

    bool acceptsFileChangeRequests() override { return true; }

    std::atomic<bool> hasWritten = false;
};

namespace {

bool isTracked(LocalStatus status) {
    return status == LocalStatus::Unmodified || status == LocalStatus::Modified ||
           status == LocalStatus::Added || status == LocalStatus::Renamed;
}

} // namespace

DefinitionStager::DefinitionStager(metadata::MetadataManager& store, cmlink::CMAdapter& adapter, Path text)
    : store_(store), adapter_(adapter), text_(std::move(text)), watch_(std::make_shared<WriteWatch>()) {
    store_.subscribe(watch_);
}

void DefinitionStager::stageIfWritten() {
    if (!isDue()) {
        return;
    }
    auto const guard = store_.acquireWriteLock();
    auto const states = adapter_.getFileStates({text_});
    auto const found = states.find(text_);
    if (found != states.end() && isTracked(found->second.getState())) {
        adapter_.addToSourceControl({text_});
    }
    watch_->hasWritten = false; // only now: after an error, the text remains due
}

void DefinitionStager::stageReturned(std::vector<Path> const& files) {
    std::vector<Path> returned;
    for (auto const& [file, state] : adapter_.getFileStates(files)) {
        if (state.getState() == LocalStatus::RemovalStaged) {
            returned.push_back(file);
        }
    }
    if (!returned.empty()) {
        adapter_.addToSourceControl(returned);
    }
}

void DefinitionStager::stageReplaced(stores::FileChanges const& files) {
    auto const states = adapter_.getFileStates(files.removed);
    bool const wasTracked =
        std::ranges::any_of(states, [](auto const& state) { return isTracked(state.second.getState()); });
    if (wasTracked) {
        adapter_.removeFromSourceControl(files.removed);
        adapter_.addToSourceControl(files.added);
    }
}

void DefinitionStager::noteWritten() noexcept {
    watch_->hasWritten = true;
}

bool DefinitionStager::isDue() const noexcept {
    return watch_->hasWritten;
}

} // namespace project::session
