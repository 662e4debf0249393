#include "project/session/ToolAccess.hpp"

#include "DiskComparison.hpp"
#include "FileAddition.hpp"
#include "FileSearch.hpp"
#include "FileTree.hpp"
#include "SessionState.hpp"
#include "fl/i18n/Utf8.hpp"
#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::session {

ToolAccess::ToolAccess(Session& session) noexcept : state_(*session.state_) {
}

stores::Backend& ToolAccess::backend() noexcept {
    if (state_.stored.log() != nullptr) {
        return *state_.stored.log();
    }
    return *state_.stored.text();
}

stores::TreeMetadataManager& ToolAccess::store() noexcept {
    return *state_.store;
}

stores::JournalBackend* ToolAccess::log() noexcept {
    return state_.stored.log();
}

stores::TextBackend& ToolAccess::text() {
    if (state_.stored.text() == nullptr) {
        throw stores::StoreError(stores::StoreError::Kind::Refused, fl::i18n::toUtf8(state_.root.native()), 0,
                                 errorTexts.get("NotAText"), errorTexts.get("RemedyOfServer"));
    }
    return *state_.stored.text();
}

stores::TreeMetadataManager& ToolAccess::personalStore() noexcept {
    return *state_.personalStore.tree();
}

bool ToolAccess::hasPersonalChanges() const noexcept {
    return state_.personalStore.steps().hasJoined();
}

stores::TextBackend& ToolAccess::personalText() noexcept {
    return state_.personalStore.text();
}

void ToolAccess::visit(Query const& query, FileVisitor const& visitor) {
    visitFound(query, *state_.store, *state_.personalStore.tree(), state_.root, visitor);
}

FileLevel ToolAccess::level(metadata::MetadataPath const& address) {
    return FileTree(*state_.store, state_.root).level(address);
}

metadata::MetadataPath ToolAccess::addressOf(Path const& path) const {
    return FileTree(*state_.store, state_.root).addressOf(path);
}

DiskDifferences ToolAccess::compareWithDisk(Path const& folder, DiskProgress const& progress) {
    FileTree const files(*state_.store, state_.root);
    DiskComparison comparison(files, state_.root);
    comparison.run(folder, progress);
    return comparison.take();
}

void ToolAccess::addBelowLabelledFolders(std::vector<Path> const& added) {
    session::addBelowLabelledFolders(added, state_.project->getFileManager());
}

void ToolAccess::loadChildren(metadata::MetadataPath const& address, stores::ChildSink& children) {
    state_.store->loadChildren(address, children);
}

void ToolAccess::markTextForStaging() noexcept {
    if (state_.stager) {
        state_.stager->noteWritten();
    }
}

cmlink::ReentrantReadWriteLock::LockGuard ToolAccess::guardForSourceControl() {
    return state_.stored.text() != nullptr ? state_.store->acquireWriteLock()
                                           : state_.store->acquireReadLock();
}

void ToolAccess::stageReturned(std::vector<Path> const& files) {
    if (state_.stager) {
        auto const guard = guardForSourceControl();
        state_.stager->stageReturned(files);
    }
}

void ToolAccess::stageReplaced(stores::FileChanges const& files) {
    if (state_.stager) {
        state_.stager->stageReplaced(files);
    }
}

std::vector<Path> ToolAccess::trackedOutsideProject(std::vector<Path> const& folders) {
    std::vector<Path> result;
    if (state_.adapter) {
        auto const guard = guardForSourceControl();
        for (auto const& file : state_.adapter->trackedBelow(folders)) {
            if (!state_.project->getFileManager().isFileInProject(file)) {
                result.push_back(file);
            }
        }
    }
    return result;
}

} // namespace project::session
