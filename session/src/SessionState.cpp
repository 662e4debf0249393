#include "SessionState.hpp"

#include <filesystem>
#include <limits>
#include <system_error>
#include <utility>

#include "ChangeEvents.hpp"
#include "SessionProjectManager.hpp"
#include "fl/i18n/Utf8.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/SystemDisk.hpp"

namespace project::session {

using git::GitAdapter;
using git::GitEnvironment;
using management::CMAwareProjectManager;
using management::DispatchableProjectEventBroadcaster;
using management::EventBroadcastingProjectManager;
using management::ProjectManagerBase;
using metadata::MetadataPath;
using stores::StoreError;
using stores::TextBackend;
using stores::TreeMetadataManager;

namespace {

std::unique_ptr<GitAdapter> makeAdapter(Path const& root, Options options) {
    if (options.sourceControl == SourceControl::Off) {
        return nullptr;
    }
    return std::make_unique<GitAdapter>(root, options.honoursEnvironment ? GitEnvironment::Honoured
                                                                         : GitEnvironment::Ignored);
}

TextBackend::Options textOptions(Options options) {
    TextBackend::Options result;
    if (options.sourceControl == SourceControl::EachChange) {
        result.alwaysRewritten = std::numeric_limits<std::size_t>::max(); // a staged text has no tail
    }
    return result;
}

} // namespace

Session::State::State(Path const& folder, Options options)
    : root(fl::filesystem::canonical(folder, Path())),
      text(nullptr),
      adapter(makeAdapter(root, options)),
      store(makeStore(options)),
      stager(makeStager()),
      events(std::make_shared<DispatchableProjectEventBroadcaster>()),
      managers(makeManagers()),
      files(managers.sourceControl,
            [this](Path const& file) { return project->getFileManager().isFileInProject(file); }),
      executor(*store, adapter.get(),
               options.sourceControl == SourceControl::EachChange ? stager.get() : nullptr, files, raised,
               events),
      project(std::make_unique<SessionProjectManager>(std::move(managers.outermost), executor)) {
}

std::shared_ptr<TreeMetadataManager> Session::State::makeStore(Options options) {
    auto backend = std::make_unique<TextBackend>(stores::makeSystemDisk(root, TextBackend::folderName),
                                                 textOptions(options));
    text = backend.get();
    return std::make_shared<TreeMetadataManager>(std::move(backend), root / TextBackend::folderName);
}

std::unique_ptr<DefinitionStager> Session::State::makeStager() {
    if (!adapter) {
        return nullptr;
    }
    return std::make_unique<DefinitionStager>(*store, *adapter, TextBackend::textPath(root));
}

Session::State::Managers Session::State::makeManagers() {
    Managers result{std::make_unique<ProjectManagerBase>(root, store)};
    if (adapter) {
        auto aware = std::make_unique<CMAwareProjectManager>(std::move(result.outermost), *adapter);
        result.sourceControl = aware.get();
        result.outermost = std::move(aware);
    }
    result.outermost =
        std::make_unique<EventBroadcastingProjectManager>(std::move(result.outermost), raised.input());
    return result;
}

void Session::State::requireProject() const {
    std::error_code error; // a text that cannot be seen may exist: the store reports why it cannot read it
    auto const status =
        std::filesystem::symlink_status(fl::filesystem::toSystem(TextBackend::textPath(root)), error);
    if (status.type() == std::filesystem::file_type::not_found) {
        throw StoreError(StoreError::Kind::Refused, fl::i18n::toUtf8(root.native()), 0,
                         "there is no project in this folder", "Check the path, or create a project there.");
    }
}

bool Session::State::createProject(std::u16string const& name) {
    try {
        auto const guard = store->acquireWriteLock();
        bool const isMissing = isStoreEmpty();
        if (isMissing) {
            project->create(name);
        }
        return isMissing;
    } catch (StoreError const& error) {
        // There was no folder to lock, so another process may have created the project at the same time.
        if (error.kind() == StoreError::Kind::Busy && !isStoreEmpty()) {
            return false;
        }
        throw;
    }
}

bool Session::State::isStoreEmpty() const {
    return store->getChildNodes(MetadataPath::root()).empty();
}

void Session::State::stage() {
    if (stager && stager->isDue()) {
        text->tidy();
        stager->stageIfWritten();
    }
}

bool Session::State::refresh() {
    queueEventsOfOthers();
    bool hasDispatched = false;
    while (auto const event = nextEventOfOthers()) {
        hasDispatched = true;
        (*event)(*events);
    }
    return hasDispatched;
}

void Session::State::queueEventsOfOthers() {
    auto const guard = store->acquireReadLock(); // the project stays as the changes have left it
    auto const changes = store->takeOthersChanges();
    if (!changes.everything && changes.differences.empty()) {
        return;
    }
    auto found = eventsOf(changes, store, root);
    std::lock_guard const lock(eventsOfOthersMutex_);
    std::move(found.begin(), found.end(), std::back_inserter(eventsOfOthers_));
}

/// Removes the event before it is dispatched: an event whose slot throws is not dispatched twice.
std::optional<Event> Session::State::nextEventOfOthers() {
    std::lock_guard const lock(eventsOfOthersMutex_);
    if (eventsOfOthers_.empty()) {
        return std::nullopt;
    }
    auto event = std::move(eventsOfOthers_.front());
    eventsOfOthers_.pop_front();
    return event;
}

} // namespace project::session
