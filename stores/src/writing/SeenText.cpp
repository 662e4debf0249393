#include "writing/SeenText.hpp"

#include <algorithm>
#include <utility>

#include "project/stores/StoreError.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

namespace {

using std::chrono::milliseconds;

/// The coarsest clock by which a kernel stamps files ticks a hundred times a second.
constexpr std::int64_t youngerThanATick = 20'000'000;

/// For how long there may be no text where the other files of a store are: git takes the old one away before
/// it makes the new one, and makes it last where it brings a project. Then it is taken for what a writer left
/// that died before it had made one.
constexpr milliseconds longestWithoutText(200);

std::string pathOfText(Disk const& disk) {
    return disk.folder() + "/" + StoreFiles::text;
}

/// True when a write after the given time leaves other times behind than the file has. Times that lie in the
/// future tell nothing.
bool isSettledAt(FileIdentity const& file, std::int64_t time) {
    return std::max(file.modified, file.changed) + youngerThanATick < time;
}

bool isWithoutNodes(ProjectText const& text) {
    return text.tailSize() == 0 && text.body() == ProjectText::empty().body();
}

} // namespace

Changes SeenText::look(milliseconds patience) {
    Changes changes;
    milliseconds waited(0);
    milliseconds nap(1);
    while (!lookOnce(changes, waited >= std::min(patience, longestWithoutText))) {
        if (waited >= patience) {
            throw StoreError(
                StoreError::Kind::Damaged, pathOfText(disk_), 0,
                seen_ ? "is gone, or ends before its last line" : "ends before its last line",
                "If git or an editor is writing it, try again when that is done; otherwise bring "
                "back a whole one, for instance with git checkout.");
        }
        nap = std::min(nap, patience - waited);
        disk_.pause(nap);
        waited += nap;
        nap = std::min(nap * 2, milliseconds(50));
    }
    return changes;
}

bool SeenText::lookOnce(Changes& changes, bool mayBeUnmade) {
    if (seen_) {
        auto const now = disk_.identifyByPath(StoreFiles::text);
        if (!now) {
            return acceptMissing();
        }
        if (*now == seen_->identity && seen_->isSettled) {
            return true;
        }
        if (now->isSameFile(seen_->identity) && now->size > seen_->text.size() && takeInTail(changes)) {
            return true;
        }
    }
    return readAnew(changes, mayBeUnmade);
}

bool SeenText::takeInTail(Changes& changes) {
    if (!staysInFolder_ && !disk_.openFolder()) {
        return false;
    }
    auto const before = disk_.now();
    auto const added = disk_.read(StoreFiles::text, seen_->text.size());
    if (!added || !added->identity.isSameFile(seen_->identity)) {
        return false;
    }
    auto differences = seen_->text.extend(added->bytes);
    if (!differences) {
        return false;
    }
    seen_->identity = added->identity;
    seen_->isSettled = isSettledAt(added->identity, before);
    addChanges(changes, {false, std::move(*differences)});
    return true;
}

bool SeenText::readAnew(Changes& changes, bool mayBeUnmade) {
    if (!staysInFolder_ && !disk_.openFolder()) {
        return acceptMissing();
    }
    auto const before = disk_.now();
    auto content = disk_.read(StoreFiles::text, 0);
    if (!content) {
        bool const isAwaited = !seen_ && !mayBeUnmade && disk_.identify(StoreFiles::attributes);
        return !isAwaited && acceptMissing();
    }
    bool const isSettled = isSettledAt(content->identity, before);
    if (seen_ && seen_->text.hasSameBytes(content->bytes)) {
        seen_->identity = content->identity;
        seen_->isSettled = isSettled;
        return true;
    }
    auto text = ProjectText::read(std::move(content->bytes), pathOfText(disk_));
    if (!text) {
        return false;
    }
    addChanges(changes, seen_ ? Changes{false, seen_->text.differencesTo(*text)} : Changes{true, {}});
    seen_ = Seen{std::move(*text), content->identity, isSettled};
    return true;
}

/// Where nothing was seen there is no store yet, and a text that held no nodes goes without loss: its maker
/// took it back. Any other text that isn't there is just being written.
bool SeenText::acceptMissing() {
    if (seen_ && !isWithoutNodes(seen_->text)) {
        return false;
    }
    seen_.reset();
    return true;
}

void SeenText::replaced(ProjectText text, WrittenFile const& file) {
    seen_ = Seen{std::move(text), file.identity, file.isStamped};
}

void SeenText::appended(std::string_view lines, WrittenFile const& file) {
    // Where somebody else appended as well, the size tells, and the next look reads all of it.
    bool const isWhole = seen_->text.append(lines) && seen_->text.size() == file.identity.size;
    seen_->identity = file.identity;
    seen_->isSettled = file.isStamped && isWhole;
}

void SeenText::distrust() noexcept {
    if (seen_) {
        seen_->isSettled = false;
    }
}

void addChanges(Changes& earlier, Changes later) {
    earlier.everything = earlier.everything || later.everything;
    earlier.differences.insert(earlier.differences.end(), std::make_move_iterator(later.differences.begin()),
                               std::make_move_iterator(later.differences.end()));
}

} // namespace project::stores
