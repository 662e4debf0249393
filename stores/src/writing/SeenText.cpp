#include "writing/SeenText.hpp"

#include <algorithm>
#include <utility>

#include "project/stores/StoreError.hpp"
#include "text/TextDifference.hpp"
#include "texts/ErrorTexts.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

namespace {

using std::chrono::milliseconds;

/// The coarsest clock by which a kernel stamps files ticks a hundred times a second.
constexpr std::int64_t youngerThanATick = 20'000'000;

/// How long to wait for the text of a folder that contains the other files of a store. Git deletes the old
/// text before it creates the new one, and creates it last when it creates a project. After this time, the
/// folder is taken for that of a writer that died before it created a text.
constexpr milliseconds longestWithoutText(200);

/// True if a write after the given time leaves other times than those of the file. Times in the future say
/// nothing.
bool isOlderThanATick(FileIdentity const& file, std::int64_t time) {
    return std::max(file.modified, file.changed) + youngerThanATick < time;
}

bool isWithoutNodes(ProjectText const& text) {
    return text.tailSize() == 0 && text.body() == ProjectText::empty().body();
}

} // namespace

Changes SeenText::checkForChanges(milliseconds patience) {
    Changes changes;
    milliseconds waited(0);
    milliseconds nap(1);
    while (!checkOnce(changes, waited >= std::min(patience, longestWithoutText))) {
        if (waited >= patience) {
            throw StoreError(StoreError::Kind::Damaged, StoreFiles::pathOfText(disk_), 0,
                             errorTexts.get(seen_ ? "MissingOrEndsEarly" : "EndsEarly"),
                             errorTexts.get("RemedyOfUnfinished"));
        }
        nap = std::min(nap, patience - waited);
        disk_.pause(nap);
        waited += nap;
        nap = std::min(nap * 2, milliseconds(50));
    }
    return changes;
}

bool SeenText::checkOnce(Changes& changes, bool acceptsNoText) {
    if (seen_) {
        auto const now = disk_.identifyByPath(StoreFiles::text);
        if (!now) {
            return acceptMissing(changes);
        }
        if (*now == seen_->identity && seen_->isReliable) {
            return true;
        }
        if (now->isSameFile(seen_->identity) && now->size > seen_->text.size() && applyAppended(changes)) {
            return true;
        }
    }
    return readAll(changes, acceptsNoText);
}

bool SeenText::applyAppended(Changes& changes) {
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
    seen_->isReliable = isOlderThanATick(added->identity, before);
    addChanges(changes, {false, std::move(*differences)});
    return true;
}

bool SeenText::readAll(Changes& changes, bool acceptsNoText) {
    if (!staysInFolder_ && !disk_.openFolder()) {
        return acceptMissing(changes);
    }
    auto const before = disk_.now();
    auto content = disk_.read(StoreFiles::text, 0);
    if (!content) {
        bool const isAwaited = !seen_ && !acceptsNoText && disk_.identify(StoreFiles::attributes);
        return !isAwaited && acceptMissing(changes);
    }
    bool const isReliable = isOlderThanATick(content->identity, before);
    if (seen_ && seen_->text.hasSameBytes(content->bytes)) {
        seen_->identity = content->identity;
        seen_->isReliable = isReliable;
        return true;
    }
    auto text = ProjectText::read(std::move(content->bytes), StoreFiles::pathOfText(disk_));
    if (!text) {
        return false;
    }
    addChanges(changes, differencesTo(*text));
    seen_ = Seen{std::move(*text), content->identity, isReliable};
    return true;
}

/// From the earlier text, or from none if there was none.
Changes SeenText::differencesTo(ProjectText const& text) const {
    if (seen_) {
        return {false, seen_->text.differencesTo(text)};
    }
    return wasMissing_ ? Changes{false, ProjectText::empty().differencesTo(text)} : Changes{true, {}};
}

/// Without an earlier text there is no store yet. An earlier text without nodes was deleted by the writer
/// that rolled back its first batch. Any other missing text is being written by another program.
bool SeenText::acceptMissing(Changes& changes) {
    if (seen_ && !isWithoutNodes(seen_->text)) {
        if (!mayVanish_) {
            return false;
        }
        addChanges(changes, {false, seen_->text.differencesTo(ProjectText::empty())});
    }
    wasMissing_ = mayVanish_;
    seen_.reset();
    return true;
}

void SeenText::replaced(ProjectText text, WrittenFile const& file) {
    seen_ = Seen{std::move(text), file.identity, file.isStamped};
}

void SeenText::appended(std::string_view lines, WrittenFile const& file) {
    // If another program appended too, the size differs, and the next check reads the whole text.
    bool const isWhole = seen_->text.append(lines) && seen_->text.size() == file.identity.size;
    seen_->identity = file.identity;
    seen_->isReliable = file.isStamped && isWhole;
}

void SeenText::distrust() noexcept {
    if (seen_) {
        seen_->isReliable = false;
    }
}

} // namespace project::stores
