#include "project/stores/TextBackend.hpp"

#include <algorithm>
#include <optional>
#include <utility>

#include "project/stores/StoreError.hpp"
#include "text/ProjectText.hpp"
#include "writing/Leftovers.hpp"
#include "writing/NewStore.hpp"
#include "writing/SeenText.hpp"
#include "writing/StoreFiles.hpp"
#include "writing/StoreWriter.hpp"

namespace project::stores {

using std::chrono::milliseconds;

char16_t const* const TextBackend::folderName = u".projectdata";
char16_t const* const TextBackend::textName = u"project.jsonl";

namespace {

/// No line of a batch is shorter than this: a name of one character in quotes, and the line's end.
constexpr std::size_t shortestLine = 4;

char const* const settleTheConflict =
    "Settle the conflict with \"projectctl resolve\" or in an editor, and try again.";

bool hasFault(ProjectText const& text, Fault::Kind kind) {
    return std::ranges::find(text.faults(), kind, &Fault::kind) != text.faults().end();
}

/// A batch that is written and not yet kept: either the lines to append, or the text to put in place.
struct Pending {
    Batch batch; ///< of an appended one
    std::string lines;
    std::optional<ProjectText> next; ///< of an appended one made only when somebody asks for it
    bool isAppended;
};

} // namespace

class TextBackend::State {
public:
    State(std::unique_ptr<Disk> disk, Options options)
        : disk_(std::move(disk)),
          options_(options),
          seen_(*disk_),
          writer_(*disk_, seen_),
          newStore_(*disk_, seen_) {}

    Changes enter(Access access);
    void leave() noexcept;
    Children load(Address const& parent);
    FileChanges write(Batch const& batch);
    void keep();
    void discard() noexcept;
    bool tidy();
    std::string repair();
    void settle(std::string settled);
    std::vector<Fault> check();
    void tidyAtLast() noexcept;

private:
    /// Lets the lock go at the end of an operation that took it for itself.
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
    void look(milliseconds patience);
    /// Locks the folder and looks. @return false when there is no text.
    bool lockAndLook(milliseconds patience);
    void requireWritable() const;
    void requireNoFault(Fault::Kind kind, char const* remedy) const;
    FileChanges makeStore();
    Pending prepare(Batch const& batch) const;
    std::string linesToAppend(Batch const& batch) const;
    std::string writeDamagedAside();

    std::string pathOfText() const { return disk_->folder() + "/" + StoreFiles::text; }

    std::unique_ptr<Disk> disk_;
    Options options_;
    SeenText seen_;
    StoreWriter writer_;
    NewStore newStore_;
    std::optional<Pending> pending_;
    Changes unreported_;                    ///< what was seen to have changed and not yet told by enter
    std::optional<FileIdentity> clearedAt_; ///< the text when the folder held nothing of dead writers
    bool isLocked_ = false;
    bool hasWritten_ = false;
};

Changes TextBackend::State::enter(Access access) {
    try {
        if (access == Access::Write) {
            lock(options_.patience);
        }
        look(options_.patience);
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

/// Keeps other writers out of the folder that the path leads to. @return false when there is none.
bool TextBackend::State::lock(milliseconds patience) {
    for (;;) {
        if (!disk_->openFolder()) {
            return false;
        }
        if (!disk_->lock(patience)) {
            auto const holder = disk_->lockHolder();
            throw StoreError(StoreError::Kind::Busy, disk_->folder(), 0,
                             "is being written by " + (holder.empty() ? "another process" : holder),
                             "Try again when that is done.");
        }
        isLocked_ = true;
        if (disk_->isFolderInPlace()) {
            break;
        }
        leave(); // the folder was replaced while we waited
    }
    seen_.stayInFolder(true);
    clearFolder();
    return true;
}

/// Looks for what dead writers left, unless nobody else has written since this object did so.
void TextBackend::State::clearFolder() {
    auto const text = disk_->identify(StoreFiles::text);
    if (!text || text != clearedAt_) {
        removeLeftovers(*disk_);
        clearedAt_ = disk_->identify(StoreFiles::text);
    }
}

void TextBackend::State::look(milliseconds patience) {
    addChanges(unreported_, seen_.look(patience));
}

bool TextBackend::State::lockAndLook(milliseconds patience) {
    if (!lock(patience)) {
        return false;
    }
    look(patience);
    return seen_.exists();
}

Children TextBackend::State::load(Address const& parent) {
    if (!seen_.exists()) {
        return {};
    }
    if (!pending_) {
        return seen_.text().children(parent);
    }
    if (!pending_->next) {
        pending_->next = seen_.text().rewrittenWith(pending_->batch);
    }
    return pending_->next->children(parent);
}

FileChanges TextBackend::State::write(Batch const& batch) {
    requireWritable();
    FileChanges files;
    if (!seen_.exists()) {
        files = makeStore();
    }
    pending_ = prepare(batch);
    return files;
}

void TextBackend::State::requireWritable() const {
    writer_.requireKnownOutcome();
    requireNoFault(Fault::Kind::Conflict, settleTheConflict);
    requireNoFault(
        Fault::Kind::Damage,
        "Nothing is written into a damaged text. Run \"projectctl check\" to see all of the damage, "
        "and \"projectctl check --repair\" to set it aside.");
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
                         pathOfText(), found->line, found->problem, remedy);
    }
}

FileChanges TextBackend::State::makeStore() {
    if (isLocked_ && !disk_->isFolderInPlace()) {
        leave();
    }
    newStore_.makeFolder(); // also where it is there: whoever made it may have died before it was durable
    if (!isLocked_) {
        lock(options_.patience);
        look(options_.patience);
        if (seen_.exists()) {
            // The batch was made for an empty project.
            throw StoreError(
                StoreError::Kind::Busy, pathOfText(), 0,
                "was made by another process at this moment, and the batch is not in the project",
                "Try again.");
        }
    }
    return newStore_.makeFiles();
}

Pending TextBackend::State::prepare(Batch const& batch) const {
    if (auto lines = linesToAppend(batch); !lines.empty()) {
        return {batch, std::move(lines), std::nullopt, true};
    }
    return {{}, {}, seen_.text().rewrittenWith(batch), false};
}

/// Empty when the text is to be written anew: it is short, or what follows the body gets long against it, or
/// there is something to put right, or the file has another name, in a copy of the project that was made of
/// links: what is appended here would stand there too.
std::string TextBackend::State::linesToAppend(Batch const& batch) const {
    auto const& text = seen_.text();
    bool const isSound = text.faults().empty() && (text.tailSize() > 0 || text.isTidy());
    auto const room = text.bodySize() / options_.bodyToTail;
    if (!isSound || seen_.identity().isShared || text.bodySize() <= options_.alwaysRewritten ||
        text.tailSize() + batch.size() * shortestLine > room) {
        return {};
    }
    auto lines = text.tailFor(batch);
    return text.tailSize() + lines.size() <= room ? lines : std::string();
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
    newStore_.stand();
    clearedAt_ = seen_.identity();
    hasWritten_ = true;
}

void TextBackend::State::discard() noexcept {
    pending_.reset();
    if (!isLocked_) {
        newStore_.stand(); // it is for whoever has the lock now to say what is there
    } else if (newStore_.takeBack()) {
        leave(); // the lock went with the folder
    }
}

bool TextBackend::State::tidy() {
    Unlocking const unlocking(*this);
    if (!lockAndLook(options_.patience)) {
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
    if (!lockAndLook(options_.patience)) {
        return {};
    }
    writer_.requireKnownOutcome();
    requireNoFault(Fault::Kind::Conflict, settleTheConflict);
    auto const damaged = seen_.text().damagedLines();
    if (damaged.empty()) {
        return {};
    }
    // The damaged lines are safe before the text goes on without them.
    auto name = StoreFiles::newDamaged();
    disk_->create(name, damaged, std::nullopt);
    disk_->sync();
    disk_->syncFolder();
    writer_.rewrite(seen_.text().rewrittenWith({}));
    return name;
}

void TextBackend::State::settle(std::string settled) {
    auto const next = ProjectText::read(std::move(settled), pathOfText());
    if (!next || hasFault(*next, Fault::Kind::Damage) || hasFault(*next, Fault::Kind::Conflict)) {
        throw StoreError(StoreError::Kind::Refused, pathOfText(), 0,
                         "what should take the place of the text is no whole and sound text", "");
    }
    Unlocking const unlocking(*this);
    seen_.distrust();
    bool const isThere = lockAndLook(options_.patience);
    if (!isThere || !hasFault(seen_.text(), Fault::Kind::Conflict)) {
        throw StoreError(StoreError::Kind::Refused, pathOfText(), 0,
                         "the text has no markers of a merge that could be settled", "");
    }
    writer_.requireKnownOutcome();
    writer_.rewrite(next->rewrittenWith({}));
}

std::vector<Fault> TextBackend::State::check() {
    seen_.distrust();
    look(options_.patience);
    std::vector<Fault> faults;
    if (seen_.exists()) {
        faults = seen_.text().faults();
    }
    if (disk_->openFolder()) {
        for (auto const& name : disk_->list()) {
            if (StoreFiles::isDisplaced(name)) {
                faults.push_back({Fault::Kind::Displaced, 0,
                                  name +
                                      " is not the store's own: it stood in the way of a write, or was put "
                                      "in the text's place during one"});
            }
        }
    }
    return faults;
}

/// A closed project is left without a tail, unless that would take waiting.
void TextBackend::State::tidyAtLast() noexcept {
    constexpr milliseconds atOnce(0);
    try {
        Unlocking const unlocking(*this);
        if (hasWritten_ && seen_.exists() && seen_.text().tailSize() > 0 && lockAndLook(atOnce) &&
            seen_.text().tailSize() > 0) {
            requireWritable();
            writer_.rewrite(seen_.text().rewrittenWith({}));
        }
    } catch (...) {
        // the tail is as good a text as the body
    }
}

TextBackend::TextBackend(std::unique_ptr<Disk> disk) : TextBackend(std::move(disk), Options()) {
}

TextBackend::TextBackend(std::unique_ptr<Disk> disk, Options options)
    : state_(std::make_unique<State>(std::move(disk), options)) {
}

TextBackend::~TextBackend() {
    state_->tidyAtLast();
}

Changes TextBackend::enter(Access access) {
    return state_->enter(access);
}

void TextBackend::leave() noexcept {
    state_->leave();
}

Children TextBackend::load(Address const& parent) {
    return state_->load(parent);
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

void TextBackend::settle(std::string settled) {
    state_->settle(std::move(settled));
}

std::string TextBackend::repair() {
    return state_->repair();
}

std::vector<Fault> TextBackend::check() {
    return state_->check();
}

} // namespace project::stores
