#include "project/session.hpp"

#include <deque>
#include <filesystem>
#include <limits>
#include <mutex>
#include <optional>
#include <system_error>
#include <utility>

#include "ChangeEvents.hpp"
#include "DefinitionStager.hpp"
#include "StagingProjectManager.hpp"
#include "fl/i18n/Utf8.hpp"
#include "project/git/GitAdapter.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/SystemDisk.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

using git::GitAdapter;
using git::GitEnvironment;
using management::CMAwareProjectManager;
using management::DispatchableProjectEventBroadcaster;
using management::EventBroadcastingProjectManager;
using management::ProjectManager;
using management::ProjectManagerBase;
using metadata::MetadataPath;
using stores::TextBackend;
using stores::TreeMetadataManager;

/// The stack, in the order in which it goes: the outermost manager first, the store last.
class Session::State {
public:
    State(Path const& folder, Options options);

    /// @throws StoreError when no text is there.
    void requireProject() const;

    /// Makes the project if the store has nothing of one. @return whether it had not.
    bool makeProject(std::u16string const& name);

    void stage();
    bool refresh();

    Path const root;
    TextBackend* text;                   ///< the store's
    std::unique_ptr<GitAdapter> adapter; ///< null when source control is off
    std::shared_ptr<TreeMetadataManager> store;
    std::unique_ptr<DefinitionStager> stager; ///< null when source control is off
    std::shared_ptr<DispatchableProjectEventBroadcaster> events;
    std::unique_ptr<ProjectManager> project;

private:
    static TextBackend::Options textOptions(Options options);
    std::shared_ptr<TreeMetadataManager> makeStore(Options options);
    std::unique_ptr<ProjectManager> makeProject(Options options);
    void noteEventsOfOthers();
    std::optional<Event> nextEvent();

    std::mutex waitingMutex_;
    std::deque<Event> waiting_; ///< events of what others have changed, to be dispatched by refresh
};

Session::State::State(Path const& folder, Options options)
    : root(fl::filesystem::canonical(folder, Path())),
      text(nullptr),
      store(makeStore(options)),
      events(std::make_shared<DispatchableProjectEventBroadcaster>()) {
    if (options.sourceControl != SourceControl::Off) {
        adapter = std::make_unique<GitAdapter>(root, options.honoursEnvironment ? GitEnvironment::Honoured
                                                                                : GitEnvironment::Ignored);
        stager = std::make_unique<DefinitionStager>(*store, *adapter, TextBackend::textPath(root));
    }
    project = makeProject(options);
}

TextBackend::Options Session::State::textOptions(Options options) {
    TextBackend::Options result;
    if (options.sourceControl == SourceControl::EachChange) {
        result.alwaysRewritten = std::numeric_limits<std::size_t>::max(); // what is staged has no tail
    }
    return result;
}

std::shared_ptr<TreeMetadataManager> Session::State::makeStore(Options options) {
    auto backend = std::make_unique<TextBackend>(stores::makeSystemDisk(root, TextBackend::folderName),
                                                 textOptions(options));
    text = backend.get();
    return std::make_shared<TreeMetadataManager>(std::move(backend), root / TextBackend::folderName);
}

std::unique_ptr<ProjectManager> Session::State::makeProject(Options options) {
    std::unique_ptr<ProjectManager> result = std::make_unique<ProjectManagerBase>(root, store);
    if (adapter) {
        result = std::make_unique<CMAwareProjectManager>(std::move(result), *adapter);
    }
    if (options.sourceControl == SourceControl::EachChange) {
        result = std::make_unique<StagingProjectManager>(std::move(result), *stager);
    }
    return std::make_unique<EventBroadcastingProjectManager>(std::move(result), events);
}

void Session::State::requireProject() const {
    auto const file = TextBackend::textPath(root);
    std::error_code error; // what cannot be seen may be there: the store says why it cannot read it
    auto const status = std::filesystem::symlink_status(fl::filesystem::toSystem(file), error);
    if (status.type() == std::filesystem::file_type::not_found) {
        throw stores::StoreError(stores::StoreError::Kind::Refused, fl::i18n::toUtf8(root.native()), 0,
                                 "there is no project in this folder",
                                 "Check the path, or make a project there.");
    }
}

bool Session::State::makeProject(std::u16string const& name) {
    auto const guard = store->acquireWriteLock();
    bool const isMissing = store->getChildNodes(MetadataPath::root()).empty();
    if (isMissing) {
        project->create(name);
    }
    return isMissing;
}

void Session::State::stage() {
    if (stager && stager->isDue()) {
        text->tidy();
        stager->stageIfWritten();
    }
}

bool Session::State::refresh() {
    noteEventsOfOthers();
    bool hasTold = false;
    while (auto const event = nextEvent()) {
        hasTold = true;
        (*event)(*events);
    }
    return hasTold;
}

void Session::State::noteEventsOfOthers() {
    auto const guard = store->acquireReadLock(); // the project stays as the changes have left it
    auto const changes = store->takeOthersChanges();
    if (!changes.everything && changes.differences.empty()) {
        return;
    }
    auto found = eventsOf(changes, store, root);
    std::lock_guard const lock(waitingMutex_);
    std::move(found.begin(), found.end(), std::back_inserter(waiting_));
}

/// Takes an event out before it is dispatched: one whose slot throws is not told twice.
std::optional<Event> Session::State::nextEvent() {
    std::lock_guard const lock(waitingMutex_);
    if (waiting_.empty()) {
        return std::nullopt;
    }
    auto event = std::move(waiting_.front());
    waiting_.pop_front();
    return event;
}

Session Session::open(Path const& root, Options options) {
    Session result(std::make_unique<State>(root, options));
    result.state_->requireProject();
    return result;
}

Session Session::make(Path const& root, std::u16string const& name, Options options) {
    Session result(std::make_unique<State>(root, options));
    if (!result.state_->makeProject(name)) {
        throw stores::StoreError(stores::StoreError::Kind::Refused, fl::i18n::toUtf8(result.root().native()),
                                 0, "there is a project in this folder already",
                                 "Open it, or choose another folder.");
    }
    return result;
}

Session Session::openOrMake(Path const& root, std::u16string const& name, Options options) {
    Session result(std::make_unique<State>(root, options));
    result.state_->makeProject(name);
    return result;
}

Session::Session(std::unique_ptr<State> state) : state_(std::move(state)) {
}

Session::Session(Session&& other) noexcept = default;

Session& Session::operator=(Session&& other) noexcept = default;

Session::~Session() = default;

management::ProjectManager& Session::project() noexcept {
    return *state_->project;
}

std::shared_ptr<DispatchableProjectEventBroadcaster> const& Session::events() const noexcept {
    return state_->events;
}

Path const& Session::root() const noexcept {
    return state_->root;
}

bool Session::refresh() {
    return state_->refresh();
}

metadata::MetadataManager& Session::store() noexcept {
    return *state_->store;
}

stores::TextBackend& Session::text() noexcept {
    return *state_->text;
}

void Session::stage() {
    state_->stage();
}

void Session::stageReturned(std::vector<Path> const& files) {
    if (state_->stager) {
        state_->stager->stageReturned(files);
    }
}

void Session::stageLater() noexcept {
    if (state_->stager) {
        state_->stager->noteWritten();
    }
}

std::vector<Path> Session::trackedOutsideProject(std::vector<Path> const& folders) {
    std::vector<Path> result;
    if (state_->adapter) {
        auto const guard = state_->store->acquireWriteLock(); // the adapter is used by one thread at a time
        for (auto const& file : state_->adapter->trackedBelow(folders)) {
            if (!state_->project->getFileManager().isFileInProject(file)) {
                result.push_back(file);
            }
        }
    }
    return result;
}

} // namespace project::session
