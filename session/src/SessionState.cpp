#include "SessionState.hpp"

#include <exception>
#include <filesystem>
#include <set>
#include <system_error>
#include <utility>

#include "ChangeEvents.hpp"
#include "ChangeStep.hpp"
#include "DefinitionMove.hpp"
#include "DiskEntries.hpp"
#include "FileTree.hpp"
#include "MovePlan.hpp"
#include "OtherProjects.hpp"
#include "SessionProjectManager.hpp"
#include "fl/i18n/Utf8.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::session {

using git::GitAdapter;
using git::GitEnvironment;
using management::CMAwareProjectManager;
using management::DispatchableProjectEventBroadcaster;
using management::EventBroadcastingProjectManager;
using management::ProjectManagerBase;
using metadata::MetadataPath;
using std::chrono::milliseconds;
using stores::StoreError;

namespace {

GitEnvironment environmentOf(Options const& options) {
    return options.honoursEnvironment ? GitEnvironment::Honoured : GitEnvironment::Ignored;
}

std::unique_ptr<GitAdapter> makeAdapter(Path const& root, Options const& options) {
    if (options.sourceControl == SourceControl::Off) {
        return nullptr;
    }
    return std::make_unique<GitAdapter>(root, environmentOf(options));
}

} // namespace

Session::State::State(Path const& folder, Options options)
    : root(fl::filesystem::canonical(folder, Path())),
      storeFolder(root / stores::TextBackend::folderName),
      adapter(makeAdapter(root, options)),
      stored(root, options),
      store(stored.tree()),
      stager(makeStager()),
      events(std::make_shared<DispatchableProjectEventBroadcaster>()),
      managers(makeManagers()),
      files(managers.sourceControl,
            [this](Path const& file) { return project->getFileManager().isFileInProject(file); }),
      personalStore(root),
      moves(root, storeFolder, adapter.get(),
            {[this](Path const& file) { return project->getFileManager().isFileInProject(file); },
             [this] { return definitionState(); },
             [this, options](std::vector<Move> const& made, bool isRepeated) {
                 followInOthers(made, options, isRepeated);
             },
             [this](std::vector<Move> const& made) { completePersonal(made); }}),
      executor(*store, adapter.get(),
               options.sourceControl == SourceControl::EachChange ? stager.get() : nullptr, files, raised,
               events, &personalStore.steps(), std::make_shared<DispatchableProjectEventBroadcaster>(),
               &moves),
      project(
          std::make_unique<SessionProjectManager>(std::move(managers.outermost), executor, personalStore)),
      personal(*project, store, personalStore, executor),
      sync(root, environmentOf(options), *store, *project, executor, raised),
      ofOthers_(store, root, FileEvents::All) {
}

Session::State::~State() {
    moves.finish();
}

std::unique_ptr<DefinitionStager> Session::State::makeStager() {
    if (!adapter) {
        return nullptr;
    }
    return std::make_unique<DefinitionStager>(*store, *adapter, stored.file());
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
    std::error_code error; // a file that cannot be seen may exist: the store reports why it cannot read it
    auto const status = std::filesystem::symlink_status(fl::filesystem::toSystem(stored.file()), error);
    if (status.type() == std::filesystem::file_type::not_found) {
        throw StoreError(StoreError::Kind::Refused, fl::i18n::toUtf8(root.native()), 0,
                         errorTexts.get("ProjectMissing"), errorTexts.get("RemedyOfMissingProject"));
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
    bool const hasText = stored.text() != nullptr; // the location of a shared project never changes
    if (hasText && stager && stager->isDue()) {
        stored.text()->tidy(); // a staged text has no tail
        stager->stageIfWritten();
    }
    moves.finish();
}

std::vector<Move> Session::State::move(std::vector<Path> const& sources, Path const& destination) {
    ChangeStep step(executor, ChangeStep::Kind::Operation);
    MovePlan::IsInProject const isListed = [this](Path const& file) {
        return project->getFileManager().isFileInProject(file);
    };
    auto planned = MovePlan(root, storeFolder, isListed).onDisk(sources, destination);
    if (planned.empty()) {
        return planned;
    }
    DefinitionMove definition(*store, root);
    definition.run(planned, DefinitionMove::EmptiedFolders::Stay);
    movePersonal(definition.moves());
    files.move(planned);
    moves.make(planned);
    raiseEventsOf(definition.takeChanges());
    step.commit();
    return planned;
}

void Session::State::adopt(std::vector<Move> const& made) {
    ChangeStep step(executor, ChangeStep::Kind::Transaction);
    MovePlan::IsInProject const isListed = [this](Path const& file) {
        return project->getFileManager().isFileInProject(file);
    };
    auto planned = MovePlan(root, storeFolder, isListed).made(made);
    if (planned.empty()) {
        return;
    }
    DefinitionMove definition(*store, root);
    definition.run(planned, DefinitionMove::EmptiedFolders::Leave);
    movePersonal(definition.moves());
    files.add(listedFilesOf(planned));
    raiseEventsOf(definition.takeChanges());
    step.commit();
}

/// Personal labels follow the files of the project.
void Session::State::movePersonal(stores::PathMoves const& moved) {
    executor.changePersonal([&] { return personalStore.concerns(moved); },
                            [&] { personalStore.move(moved); });
}

/// The same for moves of a process that died after it had committed them. It may have moved the labels, too:
/// they are at the new paths then, and nothing changes. If a path was used twice, that cannot be known, and
/// the labels stay where they are.
void Session::State::completePersonal(std::vector<Move> const& made) {
    stores::PathMoves moved;
    std::set<Path> paths;
    for (auto const& move : made) {
        moved.add(metadata::getRelativePath(root, move.from), metadata::getRelativePath(root, move.to), true);
        paths.insert({move.from, move.to});
    }
    if (paths.size() != 2 * made.size()) {
        return;
    }
    auto& steps = personalStore.steps();
    try {
        if (personalStore.concerns(moved)) {
            constexpr std::size_t outermost = 1;
            steps.join(outermost);
            personalStore.move(moved);
            steps.commit(outermost);
        }
    } catch (StoreError const&) {
        steps.keepError(std::current_exception());
    }
}

/// The files for source control, and everything in the project below folders.
ChangedFiles Session::State::listedFilesOf(std::vector<Move> const& made) const {
    ChangedFiles result;
    for (auto const& move : made) {
        result.removed.push_back(move.from);
        FileTree(*store, root).visit(move.to, [&](VisitedFile const& file) {
            result.added.push_back(root / Path(file.path));
        });
    }
    return result;
}

void Session::State::followInOthers(std::vector<Move> const& made, Options const& options,
                                    bool isRepeated) const {
    std::vector<Path> referenced;
    for (auto const& reference :
         project->getProjectReferenceManager().getFolderReferenceManager().getReferences()) {
        referenced.push_back(reference.getLocation());
    }
    OtherProjects(root, options).follow(made, referenced, isRepeated);
}

/// The newest entry of a log, or the file of a text: every commit rewrites it or appends to it.
std::string Session::State::definitionState() const {
    if (stored.log() != nullptr) {
        auto const newest = stored.log()->journal().records(std::nullopt, 1);
        return newest.empty() ? std::string() : newest.front().position.sum;
    }
    auto const text = diskEntry(stored.file());
    if (!text) {
        return {};
    }
    return std::to_string(text->st_ino) + ' ' + std::to_string(text->st_size) + ' ' +
           std::to_string(text->st_mtim.tv_sec) + ' ' + std::to_string(text->st_mtim.tv_nsec);
}

void Session::State::raiseEventsOf(stores::Changes const& changes) {
    for (auto& event : eventsOf(changes, store, root)) {
        raised.push(std::move(event));
    }
}

void Session::State::stageNew(std::vector<Path> const& created) {
    if (adapter) {
        auto const guard = store->acquireWriteLock(); // only one thread at a time may use the adapter
        adapter->addToSourceControl(created);
    }
}

bool Session::State::awaitChange(milliseconds time) {
    if (stored.log() != nullptr) {
        stored.log()->journal().awaitChange(time);
        return !isWoken_.exchange(false);
    }
    std::unique_lock lock(wakingMutex_);
    waking_.wait_for(lock, time, [this] { return isWoken_.load(); });
    return !isWoken_.exchange(false);
}

void Session::State::wake() noexcept {
    {
        std::lock_guard const lock(wakingMutex_); // a thread between its test and its wait must not miss it
        isWoken_ = true;
    }
    waking_.notify_all();
    if (stored.log() != nullptr) {
        stored.log()->journal().wake();
    }
}

bool Session::State::refresh() {
    if (stored.log() != nullptr) {
        stored.log()->requestCheck();
    }
    bool const hasChanged = ofOthers_.dispatch(*events);
    return personal.refresh() || hasChanged;
}

} // namespace project::session
