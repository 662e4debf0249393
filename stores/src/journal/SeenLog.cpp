#include "journal/SeenLog.hpp"

#include <algorithm>
#include <utility>
#include <vector>

#include "journal/BodySearch.hpp"
#include "project/stores/StoreError.hpp"
#include "text/TextDifference.hpp"
#include "text/TextTail.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

bool SeenLog::begin(CachedText cached) {
    std::optional<ProjectText> text;
    try {
        text = ProjectText::read(std::move(cached.text), journal_.name());
    } catch (StoreError const&) {
        return false;
    }
    if (!text || !text->faults().empty() || cached.position.version == 0 ||
        text->sum() != cached.position.sum) {
        return false;
    }
    replaced(*std::move(text), std::move(cached.position));
    return true;
}

std::optional<std::uint64_t> SeenLog::version() const {
    return position_.version > 0 ? std::optional(position_.version) : std::nullopt;
}

void SeenLog::follow(JournalLook look, Changes& changes) {
    if (position_.version == 0) {
        readAll(std::move(look), changes);
    } else if (!look.entries.empty() && look.entries.front().position == position_) {
        newest_ = look.entries.back().position;
        damage_.reset();
        apply(std::span(look.entries).subspan(1), changes);
    } else {
        bool const isCleaned =
            !look.entries.empty() && look.entries.front().position.version > position_.version;
        readAgain(isCleaned ? HistoryLoss::Kind::Cleaned : HistoryLoss::Kind::Reset, changes);
    }
}

/// Reads a log that has lost the entry that was seen.
void SeenLog::readAgain(HistoryLoss::Kind kind, Changes& changes) {
    SeenLog now(journal_);
    Changes ignored;
    now.readAll(journal_.look(std::nullopt), ignored);
    noteLoss({kind, position_.version, now.newest_.version});
    newest_ = now.newest_;
    damage_ = now.damage_;
    if (now.hasRead_) {
        replaceText(std::move(now.text_), now.position_, changes);
    }
}

bool SeenLog::readFrom(JournalPosition const& body, Changes& changes) {
    JournalLook const look = journal_.look(body.version);
    if (look.entries.empty() || look.entries.front().position != body) {
        return false;
    }
    ReadBody read = fetchBody(body);
    if (!read.text) {
        return false;
    }
    newest_ = look.entries.back().position;
    damage_.reset();
    replaceText(*std::move(read.text), body, changes);
    apply(std::span(look.entries).subspan(1), changes);
    return true;
}

void SeenLog::appended(std::string_view lines, JournalPosition position) {
    text_.append(lines);
    newest_ = position_ = std::move(position);
}

void SeenLog::replaced(ProjectText text, JournalPosition position) {
    text_ = std::move(text);
    newest_ = position_ = std::move(position);
    damage_.reset();
    hasRead_ = true;
}

/// Reads the result of a look without a version.
void SeenLog::readAll(JournalLook look, Changes& changes) {
    damage_.reset();
    newest_ = look.entries.empty() ? JournalPosition() : look.entries.back().position;
    if (look.entries.empty()) {
        if (!hasRead_) {
            replaceText(ProjectText::empty(), {}, changes);
        }
        return;
    }
    JournalEntry const& first = look.entries.front();
    ReadBody body;
    if (!first.isBody) {
        body.problem = errorTexts.get("BodyMissing");
    } else {
        body = look.body ? readBody(*std::move(look.body), first.position) : fetchBody(first.position);
    }
    if (body.text) {
        replaceText(*std::move(body.text), first.position, changes);
        apply(std::span(look.entries).subspan(1), changes);
    } else {
        damage_ = DamagedEntry{first.position.version, body.problem};
        readEarlier(first.position, changes);
    }
}

/// Reads the entries that precede a damaged body, as far as the history is still there. They may contain
/// everything that the body contains.
void SeenLog::readEarlier(JournalPosition const& damaged, Changes& changes) {
    auto body = newestBody(journal_, damaged.version);
    while (body && !readFrom(*body, changes)) {
        body = newestBody(journal_, body->version);
    }
}

void SeenLog::apply(std::span<JournalEntry const> entries, Changes& changes) {
    for (JournalEntry const& entry : entries) {
        if (!entry.isBody && damage_) {
            continue;
        }
        std::string problem = entry.isBody ? applyBody(entry, changes) : applyBatch(entry, changes);
        if (problem.empty()) {
            damage_.reset();
        } else if (!damage_) {
            damage_ = DamagedEntry{entry.position.version, std::move(problem)};
        }
    }
}

/// @return the problem if the batch cannot be applied.
std::string SeenLog::applyBatch(JournalEntry const& entry, Changes& changes) {
    if (std::string problem = problemOfChain(entry); !problem.empty()) {
        return problem;
    }
    if (closingSum(entry.lines) != entry.position.sum) {
        return errorTexts.get("SumWrong");
    }
    auto differences = text_.extend(entry.lines);
    if (!differences) {
        return errorTexts.get("SumWrong");
    }
    position_ = entry.position;
    addChanges(changes, {false, std::move(*differences)});
    return {};
}

/// @return the problem if the body cannot be read.
std::string SeenLog::applyBody(JournalEntry const& entry, Changes& changes) {
    if (!damage_) {
        if (std::string problem = problemOfChain(entry); !problem.empty()) {
            return problem;
        }
        if (computeBody(entry, changes)) {
            return {};
        }
    }
    ReadBody body = fetchBody(entry.position);
    if (!body.text) {
        return body.problem;
    }
    replaceText(*std::move(body.text), entry.position, changes);
    return {};
}

/// Computes a body from the text before it and the batch that was written with it, if the entry contains that
/// batch. The same definition always has the same canonical text, so the checksum shows whether it is the
/// body.
/// @return false, with nothing changed, if it is another one.
bool SeenLog::computeBody(JournalEntry const& entry, Changes& changes) {
    std::string before;
    std::vector<Difference> differences;
    if (!entry.lines.empty()) {
        before = text_.bytes();
        auto found = text_.extend(entry.lines);
        if (!found) {
            return false;
        }
        differences = std::move(*found);
    }
    ProjectText body = text_.rewrittenWith({});
    if (body.sum() == entry.position.sum) {
        text_ = std::move(body);
        position_ = entry.position;
        addChanges(changes, {false, std::move(differences)});
        return true;
    }
    if (!before.empty()) {
        text_ = *ProjectText::read(std::move(before), journal_.name());
    }
    return false;
}

/// The reason why an entry does not follow the text; empty if it does.
std::string SeenLog::problemOfChain(JournalEntry const& entry) const {
    if (entry.position.version != position_.version + 1) {
        return errorTexts.get("EntryMissing");
    }
    return entry.after == position_.sum ? std::string() : errorTexts.get("EntryUnchained");
}

SeenLog::ReadBody SeenLog::fetchBody(JournalPosition const& position) {
    try {
        return readBody(journal_.body(position), position);
    } catch (StoreError const& error) {
        if (error.kind() != StoreError::Kind::Damaged) {
            throw;
        }
        return {std::nullopt, error.problem()};
    }
}

SeenLog::ReadBody SeenLog::readBody(std::string bytes, JournalPosition const& position) const {
    std::optional<ProjectText> text;
    try {
        text = ProjectText::read(std::move(bytes), journal_.name());
    } catch (StoreError const& error) {
        return {std::nullopt, error.problem()};
    }
    if (!text || !text->isTidy() || text->sum() != position.sum) {
        return {std::nullopt, errorTexts.get("SumWrong")};
    }
    return {std::move(text), {}};
}

void SeenLog::replaceText(ProjectText text, JournalPosition const& position, Changes& changes) {
    addChanges(changes, hasRead_ ? Changes{false, text_.differencesTo(text)} : Changes{true, {}});
    text_ = std::move(text);
    position_ = position;
    hasRead_ = true;
}

/// Joins a loss with one that was not taken yet.
void SeenLog::noteLoss(HistoryLoss loss) {
    if (loss_) {
        loss.seen = std::max(loss.seen, loss_->seen);
        loss.kind = loss_->kind == HistoryLoss::Kind::Reset ? loss_->kind : loss.kind;
    }
    loss_ = loss;
}

} // namespace project::stores
