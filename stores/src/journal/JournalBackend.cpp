#include "project/stores/JournalBackend.hpp"

#include <algorithm>
#include <atomic>
#include <utility>

#include "fl/i18n/Utf8.hpp"
#include "journal/BodySearch.hpp"
#include "journal/SeenLog.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/stores/StoreError.hpp"
#include "text/ProjectText.hpp"
#include "text/TextDifference.hpp"
#include "text/TextTail.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

using Clock = std::chrono::steady_clock;

namespace {

/// A batch between write and keep.
struct PendingEntry {
    Batch batch;                     ///< of a batch without a body
    std::string lines;               ///< empty if they are too long
    std::optional<ProjectText> next; ///< of a batch without a body: created on request
    bool isBody;
};

} // namespace

class JournalBackend::State {
public:
    State(std::unique_ptr<Journal> log, Options options, std::unique_ptr<JournalCache> textCache)
        : journal(std::move(log)), options_(options), cache_(std::move(textCache)), seen_(*journal) {}

    Changes enter(Access access);
    void leave() noexcept;
    void load(Address const& parent, ChildSink& children);
    void write(Batch const& batch);
    void keep();
    void discard() noexcept;
    Status status();
    std::string text();
    void replace(std::string text);
    bool tidy();
    std::size_t deleteHistory(std::uint64_t version);
    std::vector<Fault> check();
    std::vector<Fault> faults();
    std::optional<SetAside> repair();
    void storeInCache() noexcept;

    std::optional<HistoryLoss> takeHistoryLoss() { return seen_.takeLoss(); }

    std::optional<HistoryLoss> historyLoss() const noexcept { return seen_.loss(); }

    void requestCheck() noexcept { isCheckRequested_ = true; }

    bool isShowingLastState() const noexcept { return isShowingLastState_; }

    std::unique_ptr<Journal> const journal;

private:
    /// Releases the lock at the end of an operation that took it.
    class Unlocking {
    public:
        explicit Unlocking(State& state) : state_(state) {}

        ~Unlocking() { state_.leave(); }

        Unlocking(Unlocking const&) = delete;
        Unlocking& operator=(Unlocking const&) = delete;

    private:
        State& state_;
    };

    void beginFromCache();
    void checkForReading();
    void checkForChanges();
    void lockAndCheck();
    void follow(JournalLook look);
    void requireRead() const;
    void requireUndamaged() const;
    void requireNoReset() const;
    StoreError damageError() const;
    SeenLog readAgain() const;
    std::vector<Fault> faultsOf(SeenLog const& log) const;
    std::string problemOf(SeenLog const& log) const;
    PendingEntry prepare(Batch const& batch) const;
    JournalPosition append(JournalPosition const& after, std::string_view lines, ProjectText const* body,
                           std::string_view sum);
    void appendBody(ProjectText body, std::string_view lines);

    Options options_;
    std::unique_ptr<JournalCache> cache_;
    SeenLog seen_;
    std::optional<PendingEntry> pending_;
    Changes unreported_; ///< changes that were found and not yet returned by enter
    std::optional<Clock::time_point> lastCheck_;
    JournalPosition cached_; ///< the position of the text in the cache
    bool hasBegun_ = false;
    bool isLocked_ = false;
    bool isShowingLastState_ = false;
    std::atomic<bool> isCheckRequested_ = false;
};

Changes JournalBackend::State::enter(Access access) {
    try {
        if (access == Access::Write) {
            lockAndCheck();
        } else {
            checkForReading();
        }
        requireRead();
    } catch (...) {
        leave();
        throw;
    }
    return std::exchange(unreported_, {});
}

void JournalBackend::State::leave() noexcept {
    if (isLocked_) {
        journal->unlock();
    }
    isLocked_ = false;
}

void JournalBackend::State::beginFromCache() {
    if (std::exchange(hasBegun_, true) || !cache_) {
        return;
    }
    auto cached = cache_->load();
    if (cached && seen_.begin(*std::move(cached))) {
        cached_ = seen_.position();
        unreported_.everything = true;
    }
}

void JournalBackend::State::checkForReading() {
    isShowingLastState_ = false;
    bool const isRequested = isCheckRequested_.exchange(false);
    if (!isRequested && lastCheck_ && Clock::now() - *lastCheck_ < options_.freshness) {
        return;
    }
    try {
        checkForChanges();
    } catch (StoreError const& error) {
        isShowingLastState_ =
            error.kind() == StoreError::Kind::Unreachable && options_.readsLastState && seen_.hasRead();
        if (!isShowingLastState_) {
            throw;
        }
    }
}

void JournalBackend::State::checkForChanges() {
    beginFromCache();
    follow(journal->look(seen_.version()));
}

void JournalBackend::State::lockAndCheck() {
    beginFromCache();
    JournalLook look = journal->lock(options_.patience, seen_.version());
    isLocked_ = true;
    isShowingLastState_ = false;
    follow(std::move(look));
}

void JournalBackend::State::follow(JournalLook look) {
    lastCheck_.reset();
    seen_.follow(std::move(look), unreported_);
    lastCheck_ = Clock::now();
}

void JournalBackend::State::load(Address const& parent, ChildSink& children) {
    if (!pending_) {
        seen_.text().children(parent, children);
        return;
    }
    if (!pending_->next) {
        pending_->next = seen_.text().rewrittenWith(pending_->batch);
    }
    pending_->next->children(parent, children);
}

void JournalBackend::State::write(Batch const& batch) {
    requireUndamaged();
    requireNoReset();
    pending_ = prepare(batch);
}

/// @throws StoreError if nothing of the log is readable.
void JournalBackend::State::requireRead() const {
    if (!seen_.hasRead()) {
        throw damageError();
    }
}

void JournalBackend::State::requireUndamaged() const {
    if (seen_.damage()) {
        throw damageError();
    }
}

void JournalBackend::State::requireNoReset() const {
    auto const& loss = seen_.loss();
    if (loss && loss->kind == HistoryLoss::Kind::Reset) {
        throw StoreError(StoreError::Kind::Refused, journal->name(), 0,
                         errorTexts.get("ServerReset", loss->seen, loss->found),
                         errorTexts.get("RemedyOfReset"));
    }
}

StoreError JournalBackend::State::damageError() const {
    return StoreError(StoreError::Kind::Damaged, journal->name(), 0, problemOf(seen_),
                      errorTexts.get("RemedyOfDamagedLog"));
}

/// Describes the damage of a log.
std::string JournalBackend::State::problemOf(SeenLog const& log) const {
    std::uint64_t const version = log.damage()->version;
    std::uint64_t const later = log.newest().version - version;
    std::string const& problem = log.damage()->problem;
    return later > 0 ? errorTexts.get("LogDamagedBeforeLater", version, problem, later)
                     : errorTexts.get("LogDamaged", version, problem);
}

/// A batch is committed with a body if it is the first, if it is long, or if the tail becomes long compared
/// with the body. The entry of a body contains the lines of its batch if these alone would fit into the tail.
PendingEntry JournalBackend::State::prepare(Batch const& batch) const {
    ProjectText const& text = seen_.text();
    std::size_t const room = std::max(options_.shortTail, text.bodySize() / options_.bodyToTail);
    std::size_t const longest = std::min(room, Journal::longestBatch);
    PendingEntry pending{{}, {}, std::nullopt, true};
    if (seen_.position().version > 0 && batch.size() * shortestLine <= longest) {
        pending.lines = text.tailFor(batch, longest);
    }
    pending.isBody = pending.lines.empty() || text.tailSize() + pending.lines.size() > room;
    if (pending.isBody) {
        pending.next = text.rewrittenWith(batch);
    } else {
        pending.batch = batch;
    }
    return pending;
}

void JournalBackend::State::keep() {
    if (!pending_) {
        return;
    }
    if (pending_->isBody) {
        appendBody(*std::move(pending_->next), pending_->lines);
    } else {
        auto position = append(seen_.position(), pending_->lines, nullptr, closingSum(pending_->lines));
        seen_.appended(pending_->lines, std::move(position));
    }
    pending_.reset();
}

void JournalBackend::State::appendBody(ProjectText body, std::string_view lines) {
    auto position = append(seen_.newest(), lines, &body, body.sum());
    seen_.replaced(std::move(body), std::move(position));
}

/// Appends an entry after another one.
/// @param body null for a batch.
/// @return its position.
JournalPosition JournalBackend::State::append(JournalPosition const& after, std::string_view lines,
                                              ProjectText const* body, std::string_view sum) {
    NewJournalEntry entry;
    entry.position = {after.version + 1, fl::i18n::toUtf8(metadata::generateUUID()), std::string(sum)};
    entry.isBody = body != nullptr;
    entry.after = after.sum;
    entry.lines = lines;
    entry.body = body != nullptr ? std::string_view(body->body()) : std::string_view();
    auto const lastCheck = std::exchange(lastCheck_, std::nullopt); // the next guard checks if this throws
    if (journal->append(entry) == Journal::Appended::Superseded) {
        throw StoreError(StoreError::Kind::Busy, journal->name(), 0, errorTexts.get("WrittenByClient"),
                         errorTexts.get("TryAgain"));
    }
    lastCheck_ = lastCheck;
    return entry.position;
}

void JournalBackend::State::discard() noexcept {
    pending_.reset();
}

JournalBackend::Status JournalBackend::State::status() {
    checkForChanges();
    return {seen_.newest(), seen_.text().bodySize(), seen_.text().tailSize()};
}

std::string JournalBackend::State::text() {
    checkForChanges();
    requireUndamaged();
    return seen_.text().rewrittenWith({}).body();
}

void JournalBackend::State::replace(std::string text) {
    auto const next = ProjectText::read(std::move(text), errorTexts.get("NewText"));
    if (!next || next->hasFault(Fault::Kind::Damage) || next->hasFault(Fault::Kind::Conflict)) {
        throw StoreError(StoreError::Kind::Refused, journal->name(), 0, errorTexts.get("NewTextFaulty"), "");
    }
    Unlocking const unlocking(*this);
    lockAndCheck();
    requireNoReset();
    ProjectText body = next->rewrittenWith({});
    auto differences = seen_.text().differencesTo(body);
    appendBody(std::move(body), {});
    addChanges(unreported_, {false, std::move(differences)});
}

bool JournalBackend::State::tidy() {
    Unlocking const unlocking(*this);
    lockAndCheck();
    requireUndamaged();
    requireNoReset();
    if (seen_.text().tailSize() == 0) {
        return false;
    }
    appendBody(seen_.text().rewrittenWith({}), {});
    return true;
}

std::size_t JournalBackend::State::deleteHistory(std::uint64_t version) {
    Unlocking const unlocking(*this);
    lockAndCheck();
    requireUndamaged();
    requireNoReset();
    bool const isAny = version >= seen_.newest().version;
    auto const body = newestBody(*journal, isAny ? std::nullopt : std::optional(version + 1));
    if (!body) {
        return 0;
    }
    SeenLog kept(*journal);
    Changes ignored;
    if (!kept.readFrom(*body, ignored) || kept.damage()) {
        throw StoreError(StoreError::Kind::Damaged, journal->name(), 0,
                         errorTexts.get("HistoryDamaged", body->version),
                         errorTexts.get("RemedyOfDamagedLog"));
    }
    return journal->deleteBefore(body->version);
}

/// The log from its newest body on, as a new client reads it.
SeenLog JournalBackend::State::readAgain() const {
    SeenLog log(*journal);
    Changes ignored;
    log.follow(journal->look(std::nullopt), ignored);
    return log;
}

std::vector<Fault> JournalBackend::State::check() {
    return faultsOf(readAgain());
}

std::vector<Fault> JournalBackend::State::faults() {
    if (!seen_.hasRead()) {
        checkForChanges();
    }
    return faultsOf(seen_);
}

std::vector<Fault> JournalBackend::State::faultsOf(SeenLog const& log) const {
    if (!log.damage()) {
        return {};
    }
    return {{Fault::Kind::Damage, 0, problemOf(log)}};
}

std::optional<JournalBackend::SetAside> JournalBackend::State::repair() {
    Unlocking const unlocking(*this);
    lockAndCheck();
    requireNoReset();
    SeenLog const log = readAgain();
    if (!log.damage()) {
        return std::nullopt;
    }
    journal->requireOwner();
    if (!seen_.hasRead()) {
        throw StoreError(StoreError::Kind::Damaged, journal->name(), 0,
                         errorTexts.get("LogUnreadable", problemOf(log)),
                         errorTexts.get("RemedyOfUnreadableLog"));
    }
    // This client has read at least as much as is readable now, and perhaps more, before it was damaged.
    SetAside const result{log.damage()->version, log.newest().version, !seen_.damage()};
    appendBody(seen_.text().rewrittenWith({}), {});
    return result;
}

void JournalBackend::State::storeInCache() noexcept {
    bool const isReset = seen_.loss() && seen_.loss()->kind == HistoryLoss::Kind::Reset;
    if (!cache_ || !seen_.version() || seen_.position() == cached_ || isReset) {
        return;
    }
    try {
        cache_->store({seen_.position(), seen_.text().bytes()});
    } catch (...) {
        // without a cache, the next process reads the log
    }
}

JournalBackend::JournalBackend(std::unique_ptr<Journal> journal, Options options,
                               std::unique_ptr<JournalCache> cache)
    : state_(std::make_unique<State>(std::move(journal), options, std::move(cache))) {
}

JournalBackend::JournalBackend(std::unique_ptr<Journal> journal)
    : JournalBackend(std::move(journal), Options()) {
}

JournalBackend::~JournalBackend() {
    state_->storeInCache();
}

Changes JournalBackend::enter(Access access) {
    return state_->enter(access);
}

void JournalBackend::leave() noexcept {
    state_->leave();
}

void JournalBackend::load(Address const& parent, ChildSink& children) {
    state_->load(parent, children);
}

FileChanges JournalBackend::write(Batch const& batch) {
    state_->write(batch);
    return {};
}

void JournalBackend::keep() {
    state_->keep();
}

void JournalBackend::discard() noexcept {
    state_->discard();
}

std::optional<HistoryLoss> JournalBackend::takeHistoryLoss() {
    return state_->takeHistoryLoss();
}

std::optional<HistoryLoss> JournalBackend::historyLoss() const noexcept {
    return state_->historyLoss();
}

void JournalBackend::requestCheck() noexcept {
    state_->requestCheck();
}

bool JournalBackend::isShowingLastState() const noexcept {
    return state_->isShowingLastState();
}

JournalBackend::Status JournalBackend::status() {
    return state_->status();
}

std::string JournalBackend::text() {
    return state_->text();
}

void JournalBackend::replace(std::string text) {
    state_->replace(std::move(text));
}

bool JournalBackend::tidy() {
    return state_->tidy();
}

std::size_t JournalBackend::deleteHistory(std::uint64_t version) {
    return state_->deleteHistory(version);
}

std::vector<Fault> JournalBackend::faults() {
    return state_->faults();
}

std::vector<Fault> JournalBackend::check() {
    return state_->check();
}

std::optional<JournalBackend::SetAside> JournalBackend::repair() {
    return state_->repair();
}

Journal& JournalBackend::journal() noexcept {
    return *state_->journal;
}

} // namespace project::stores
