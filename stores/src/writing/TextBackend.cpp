#include "project/stores/TextBackend.hpp"

#include <algorithm>
#include <optional>
#include <utility>

#include "project/stores/StoreError.hpp"
#include "text/ProjectText.hpp"
#include "text/TextDifference.hpp"
#include "text/TextTail.hpp"
#include "texts/ErrorTexts.hpp"
#include "writing/Leftovers.hpp"
#include "writing/NewStore.hpp"
#include "writing/SeenText.hpp"
#include "writing/StoreFiles.hpp"
#include "writing/StoreWriter.hpp"

namespace project::stores {

using std::chrono::milliseconds;

char16_t const* const TextBackend::folderName = u".projectdata";
char16_t const* const TextBackend::textName = u"project.jsonl";

Path TextBackend::textPath(Path const& projectRoot) {
    return projectRoot / folderName / textName;
}

namespace {

/// A batch between write and keep: either the lines to append, or the new text.
struct Pending {
    Batch batch; ///< of a batch to append
    std::string lines;
    std::optional<ProjectText> next; ///< of a batch to append: created on request
    bool isAppended;
};

} // namespace

class TextBackend::State {
public:
    State(std::unique_ptr<Disk> disk, Options options)
        : disk_(std::move(disk)),
          options_(options),
          seen_(*disk_, options.isPersonal),
          writer_(*disk_, seen_),
          newStore_(*disk_, seen_, options.isPersonal) {}

    Changes enter(Access access);
    void leave() noexcept;
    void load(Address const& parent, ChildSink& children);
    FileChanges write(Batch const& batch);
    void keep();
    void discard() noexcept;
    bool tidy();
    std::string repair();
    void resolve(std::string resolved);
    std::vector<std::size_t> linesOf(std::vector<Address> const& addresses) const;
    std::vector<Fault> check();
    void tidyOnClose() noexcept;

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

    bool lock(milliseconds patience);
    void clearFolder();
    void checkForChanges(milliseconds patience);
    /// Locks the folder and checks for changes. @return false if there is no text.
    bool lockAndCheck(milliseconds patience);
    void requireWritable() const;
    /// @param remedy the name of its text.
    void requireNoFault(Fault::Kind kind, char const* remedy) const;
    FileChanges createStore();
    Pending prepare(Batch const& batch) const;
    std::string linesToAppend(Batch const& batch) const;

    std::string pathOfText() const { return StoreFiles::pathOfText(*disk_); }

    std::unique_ptr<Disk> disk_;
    Options options_;
    SeenText seen_;
    StoreWriter writer_;
    NewStore newStore_;
    std::optional<Pending> pending_;
    Changes unreported_;                    ///< changes that were found and not yet returned by enter
    std::optional<FileIdentity> clearedAt_; ///< the text when the folder had no leftovers
    bool isLocked_ = false;
    bool hasWritten_ = false;
};

Changes TextBackend::State::enter(Access access) {
    try {
        if (access == Access::Write) {
            lock(options_.patience);
        }
        checkForChanges(options_.patience);
    } catch (...) {
        leave();
        throw;
    }
    return std::exchange(unreported_, {});
}

void TextBackend::State::leave() noexcept {
    if (isLocked_) {
        disk_->unlock();
    }
    isLocked_ = false;
    seen_.stayInFolder(false);
}

/// Locks the folder that the path leads to. @return false if there is none.
bool TextBackend::State::lock(milliseconds patience) {
    for (;;) {
        if (!disk_->openFolder()) {
            return false;
        }
        if (!disk_->lock(patience)) {
            auto const holder = disk_->lockHolder();
            throw StoreError(StoreError::Kind::Busy, disk_->folder(), 0,
                             holder.empty() ? errorTexts.get("LockedByOther")
                                            : errorTexts.get("LockedBy", holder),
                             errorTexts.get("RemedyOfLock"));
        }
        isLocked_ = true;
        if (disk_->isFolderInPlace()) {
            break;
        }
        leave(); // the folder was replaced during the wait
    }
    seen_.stayInFolder(true);
    clearFolder();
    return true;
}

/// Removes the leftovers of dead writers, unless no other process has written since this object did so.
void TextBackend::State::clearFolder() {
    auto const text = disk_->identify(StoreFiles::text);
    if (!text || text != clearedAt_) {
        removeLeftovers(*disk_);
        clearedAt_ = disk_->identify(StoreFiles::text);
    }
}

void TextBackend::State::checkForChanges(milliseconds patience) {
    addChanges(unreported_, seen_.checkForChanges(patience));
}

bool TextBackend::State::lockAndCheck(milliseconds patience) {
    if (!lock(patience)) {
        return false;
    }
    checkForChanges(patience);
    return seen_.exists();
}

void TextBackend::State::load(Address const& parent, ChildSink& children) {
    if (!seen_.exists()) {
        return;
    }
    if (!pending_) {
        seen_.text().children(parent, children);
        return;
    }
    if (!pending_->next) {
        pending_->next = seen_.text().rewrittenWith(pending_->batch);
    }
    pending_->next->children(parent, children);
}

FileChanges TextBackend::State::write(Batch const& batch) {
    requireWritable();
    FileChanges files;
    if (!seen_.exists()) {
        files = createStore();
    }
    pending_ = prepare(batch);
    return files;
}

void TextBackend::State::requireWritable() const {
    writer_.requireKnownOutcome();
    requireNoFault(Fault::Kind::Conflict, "RemedyOfConflict");
    requireNoFault(Fault::Kind::Damage, "RemedyOfDamage");
}

void TextBackend::State::requireNoFault(Fault::Kind kind, char const* remedy) const {
    if (!seen_.exists()) {
        return;
    }
    auto const& faults = seen_.text().faults();
    auto const found =
        std::find_if(faults.begin(), faults.end(), [kind](Fault const& fault) { return fault.kind == kind; });
    if (found != faults.end()) {
        throw StoreError(kind == Fault::Kind::Conflict ? StoreError::Kind::Conflict
                                                       : StoreError::Kind::Damaged,
                         pathOfText(), found->line, found->problem, errorTexts.get(remedy));
    }
}

FileChanges TextBackend::State::createStore() {
    if (isLocked_ && !disk_->isFolderInPlace()) {
        leave();
    }
    newStore_.createFolder(); // also if it exists: its creator may have died before the name was durable
    if (!isLocked_) {
        lock(options_.patience);
        checkForChanges(options_.patience);
        if (seen_.exists()) {
            // The batch assumes an empty project.
            throw StoreError(StoreError::Kind::Busy, pathOfText(), 0, errorTexts.get("CreatedByProcess"),
                             errorTexts.get("TryAgain"));
        }
    }
    return newStore_.createFiles();
}

Pending TextBackend::State::prepare(Batch const& batch) const {
    if (auto lines = linesToAppend(batch); !lines.empty()) {
        return {batch, std::move(lines), std::nullopt, true};
    }
    return {{}, {}, seen_.text().rewrittenWith(batch), false};
}

/// Empty if the text must be rewritten: it is short, or the tail becomes long compared with the body, or the
/// text has a fault to correct, or the file has another name. In a copy of the project that consists of hard
/// links, an appended batch would be in both.
std::string TextBackend::State::linesToAppend(Batch const& batch) const {
    auto const& text = seen_.text();
    bool const isSound = text.faults().empty() && (text.tailSize() > 0 || text.isTidy());
    auto const room = text.bodySize() / options_.bodyToTail;
    if (!isSound || seen_.identity().isShared || text.bodySize() <= options_.alwaysRewritten ||
        text.tailSize() + batch.size() * shortestLine > room) {
        return {};
    }
    return text.tailFor(batch, room - text.tailSize());
}

void TextBackend::State::keep() {
    if (!pending_) {
        return;
    }
    if (pending_->isAppended) {
        writer_.append(pending_->lines);
    } else {
        writer_.rewrite(std::move(*pending_->next));
    }
    pending_.reset();
    newStore_.commit();
    clearedAt_ = seen_.identity();
    hasWritten_ = true;
}

void TextBackend::State::discard() noexcept {
    pending_.reset();
    if (!isLocked_) {
        newStore_.commit(); // without the lock, the files may belong to another writer by now
    } else if (newStore_.rollBack()) {
        leave(); // the lock was released with the folder
    }
}

bool TextBackend::State::tidy() {
    Unlocking const unlocking(*this);
    if (!lockAndCheck(options_.patience)) {
        return false;
    }
    requireWritable();
    if (seen_.text().isTidy()) {
        return false;
    }
    writer_.rewrite(seen_.text().rewrittenWith({}));
    return true;
}

std::string TextBackend::State::repair() {
    Unlocking const unlocking(*this);
    seen_.distrust();
    if (!lockAndCheck(options_.patience)) {
        return {};
    }
    writer_.requireKnownOutcome();
    requireNoFault(Fault::Kind::Conflict, "RemedyOfConflict");
    auto const damaged = seen_.text().damagedLines();
    if (damaged.empty()) {
        return {};
    }
    // The damaged lines are durable before the text is rewritten without them.
    auto name = StoreFiles::newDamaged();
    disk_->create(name, damaged, std::nullopt);
    disk_->sync();
    disk_->syncFolder();
    writer_.rewrite(seen_.text().rewrittenWith({}));
    return name;
}

void TextBackend::State::resolve(std::string resolved) {
    auto const next = ProjectText::read(std::move(resolved), pathOfText());
    if (!next || next->hasFault(Fault::Kind::Damage) || next->hasFault(Fault::Kind::Conflict)) {
        throw StoreError(StoreError::Kind::Refused, pathOfText(), 0, errorTexts.get("NewTextFaulty"), "");
    }
    Unlocking const unlocking(*this);
    seen_.distrust();
    bool const isThere = lockAndCheck(options_.patience);
    if (!isThere || !seen_.text().hasFault(Fault::Kind::Conflict)) {
        throw StoreError(StoreError::Kind::Refused, pathOfText(), 0, errorTexts.get("NoConflictMarkers"), "");
    }
    writer_.requireKnownOutcome();
    writer_.rewrite(next->rewrittenWith({}));
}

std::vector<std::size_t> TextBackend::State::linesOf(std::vector<Address> const& addresses) const {
    return seen_.exists() ? seen_.text().linesOf(addresses) : std::vector<std::size_t>(addresses.size());
}

std::vector<Fault> TextBackend::State::check() {
    seen_.distrust();
    checkForChanges(options_.patience);
    std::vector<Fault> faults;
    if (seen_.exists()) {
        faults = seen_.text().faults();
    }
    if (disk_->openFolder()) {
        for (auto const& name : disk_->list()) {
            if (StoreFiles::isDisplaced(name)) {
                faults.push_back({Fault::Kind::Displaced, 0, errorTexts.get("Displaced", name)});
            }
        }
    }
    return faults;
}

/// Tidies the text when the store is closed, unless that would require waiting.
void TextBackend::State::tidyOnClose() noexcept {
    constexpr milliseconds withoutWaiting(0);
    try {
        Unlocking const unlocking(*this);
        if (hasWritten_ && seen_.exists() && seen_.text().tailSize() > 0 && lockAndCheck(withoutWaiting) &&
            seen_.text().tailSize() > 0) {
            requireWritable();
            writer_.rewrite(seen_.text().rewrittenWith({}));
        }
    } catch (...) {
        // a tail is not a fault
    }
}

TextBackend::TextBackend(std::unique_ptr<Disk> disk) : TextBackend(std::move(disk), Options()) {
}

TextBackend::TextBackend(std::unique_ptr<Disk> disk, Options options)
    : state_(std::make_unique<State>(std::move(disk), options)) {
}

TextBackend::~TextBackend() {
    state_->tidyOnClose();
}

Changes TextBackend::enter(Access access) {
    return state_->enter(access);
}

void TextBackend::leave() noexcept {
    state_->leave();
}

void TextBackend::load(Address const& parent, ChildSink& children) {
    state_->load(parent, children);
}

FileChanges TextBackend::write(Batch const& batch) {
    return state_->write(batch);
}

void TextBackend::keep() {
    state_->keep();
}

void TextBackend::discard() noexcept {
    state_->discard();
}

bool TextBackend::tidy() {
    return state_->tidy();
}

void TextBackend::resolve(std::string resolved) {
    state_->resolve(std::move(resolved));
}

std::string TextBackend::repair() {
    return state_->repair();
}

std::vector<std::size_t> TextBackend::linesOf(std::vector<Address> const& addresses) const {
    return state_->linesOf(addresses);
}

std::vector<Fault> TextBackend::check() {
    return state_->check();
}

} // namespace project::stores
