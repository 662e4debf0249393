#include "project/session.hpp"

#include <algorithm>
#include <filesystem>
#include <stdexcept>
#include <string>
#include <system_error>
#include <utility>

#include "ChangeStep.hpp"
#include "FileSearch.hpp"
#include "NewSharedProject.hpp"
#include "SessionState.hpp"
#include "SyncRules.hpp"
#include "fl/i18n/Utf8.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/TextBackend.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::session {

using std::chrono::milliseconds;

namespace {

void requirePercentage(int similarity) {
    if (similarity < 1 || similarity > 100) {
        throw std::invalid_argument(errorTexts.get("SimilarityWrong", similarity));
    }
}

/// A project is created in an existing folder only, so that a mistyped path creates nothing.
void requireFolder(Path const& folder) {
    std::error_code error; // a folder that cannot be seen may exist: the store reports why it cannot use it
    auto const status = std::filesystem::status(fl::filesystem::toSystem(folder), error);
    if (status.type() == std::filesystem::file_type::not_found) {
        throw stores::StoreError(stores::StoreError::Kind::Refused, fl::i18n::toUtf8(folder.native()), 0,
                                 errorTexts.get("FolderMissing"), errorTexts.get("RemedyOfMissingFolder"));
    }
}

} // namespace

Session Session::open(Path const& root, Options options) {
    Session result(std::make_unique<State>(root, options));
    result.state_->requireProject();
    return result;
}

Session Session::create(Path const& root, std::u16string const& name, Options options) {
    requireFolder(root);
    Session result(std::make_unique<State>(root, options));
    if (!result.state_->createProject(name)) {
        throw stores::StoreError(stores::StoreError::Kind::Refused, fl::i18n::toUtf8(result.root().native()),
                                 0, errorTexts.get("ProjectExists"),
                                 errorTexts.get("RemedyOfExistingProject"));
    }
    return result;
}

Session Session::openOrCreate(Path const& root, std::u16string const& name, Options options) {
    requireFolder(root);
    Session result(std::make_unique<State>(root, options));
    result.state_->createProject(name);
    return result;
}

Session Session::createShared(Path const& root, std::u16string const& name, SharedStore const& shared,
                              Options options) {
    requireFolder(root);
    NewSharedProject project(root, name, shared);
    Session result(std::make_unique<State>(root, options));
    result.state_->createProject(name);
    result.state_->stageNew(project.files());
    project.keep();
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

Personal& Session::personal() noexcept {
    return state_->personal;
}

std::vector<FoundFile> Session::find(Query const& query) {
    std::vector<FoundFile> result;
    auto const guard = state_->store->acquireReadLock();
    visitFound(query, *state_->store, *state_->personalStore.tree(), state_->root,
               [&](VisitedFile const& file) {
                   result.push_back({state_->root / Path(file.path), file.kind});
               });
    return result;
}

std::vector<Move> Session::move(std::vector<Path> const& sources, Path const& destination) {
    return state_->move(sources, destination);
}

void Session::adopt(std::vector<Move> const& moves) {
    state_->adopt(moves);
}

std::optional<RecoveredMoves> Session::takeRecoveredMoves() {
    return state_->moves.takeRecovered();
}

bool Session::hasUnfinishedMove() const {
    return state_->moves.hasUnfinished();
}

std::vector<SyncRule> Session::syncRules() {
    auto const guard = state_->store->acquireReadLock();
    return readSyncRules(*state_->store, state_->root);
}

void Session::setSyncRule(SyncRule const& rule) {
    state_->sync.set(rule);
}

bool Session::removeSyncRule(Path const& folder) {
    return state_->sync.remove(folder);
}

RenamesFound Session::findRenames(RenameOptions const& options) {
    requirePercentage(options.similarity);
    auto const text = state_->storeFolder / stores::TextBackend::textName;
    return state_->sync.findRenames(options, isShared() ? state_->root : text);
}

SyncPlan Session::planSync() {
    return state_->sync.plan();
}

SyncPlan Session::sync(SyncOptions const& options) {
    requirePercentage(options.similarity);
    auto seen = planSync();
    if (seen.isEmpty()) {
        return seen;
    }
    auto step = transaction();
    auto plan = planSync(); // the project may have changed before the transaction began
    bool const seeksRenames = options.followsRenames && !plan.isEmpty();
    if (auto renamed = seeksRenames ? state_->sync.followed(findRenames({options.similarity}), plan)
                                    : std::vector<Move>();
        !renamed.empty()) {
        adopt(renamed);
        plan = planSync();
        plan.renamed = std::move(renamed);
    }
    state_->sync.apply(plan, options);
    step.commit();
    return plan;
}

Transaction Session::transaction() {
    return Transaction(std::make_unique<ChangeStep>(state_->executor, ChangeStep::Kind::Transaction));
}

std::shared_ptr<management::DispatchableProjectEventBroadcaster> const& Session::events() const noexcept {
    return state_->events;
}

Path const& Session::root() const noexcept {
    return state_->root;
}

bool Session::refresh() {
    return state_->refresh();
}

bool Session::watch(milliseconds time) {
    auto const deadline = std::chrono::steady_clock::now() + time;
    milliseconds const interval = isShared() ? std::chrono::seconds(30) : milliseconds(500);
    while (!refresh()) {
        auto const rest = std::chrono::ceil<milliseconds>(deadline - std::chrono::steady_clock::now());
        if (rest <= milliseconds(0) || !state_->awaitChange(std::min(rest, interval))) {
            return false;
        }
    }
    return true;
}

void Session::wake() noexcept {
    state_->wake();
}

bool Session::isShared() const noexcept {
    return state_->stored.log() != nullptr;
}

std::optional<stores::HistoryLoss> Session::takeHistoryLoss() {
    return isShared() ? state_->stored.log()->takeHistoryLoss() : std::nullopt;
}

metadata::MetadataManager& Session::store() noexcept {
    return *state_->store;
}

void Session::stage() {
    state_->stage();
}

} // namespace project::session
