#include "writing/StoreWriter.hpp"

#include <utility>

#include "texts/ErrorTexts.hpp"
#include "writing/Leftovers.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

namespace {

/// The remedy after a failure with an unknown outcome.
std::string reopenAfter(StoreError const& failure) {
    return failure.remedy() + (failure.remedy().empty() ? "" : " ") + errorTexts.get("ThenReopenAndCheck");
}

} // namespace

void StoreWriter::append(std::string_view lines) {
    auto const before = seen_.identity();
    if (!isInPlace(before)) {
        throwReplaced();
    }
    auto const written = appendOrRollBack(lines, before);
    if (!written) {
        throwReplaced();
    }
    bool isStillInPlace = false;
    try {
        disk_.sync();
        isStillInPlace = isInPlace(before);
    } catch (StoreError const& failure) {
        rollBack(written->identity, failure);
        throw;
    }
    if (!isStillInPlace) {
        if (!disk_.isFolderInPlace()) {
            // The folder was moved away with the batch in it. The batch must not return with the folder.
            rollBack(written->identity, StoreError(StoreError::Kind::Busy, StoreFiles::pathOfText(disk_), 0,
                                                   errorTexts.get("MovedAway"), ""));
        }
        throwReplaced();
    }
    seen_.appended(lines, *written);
}

std::optional<WrittenFile> StoreWriter::appendOrRollBack(std::string_view lines, FileIdentity const& before) {
    try {
        return disk_.append(StoreFiles::text, before, lines);
    } catch (StoreError const& failure) {
        auto left = before;
        bool mayBeComplete = true;
        try {
            // Readers ignore a torn batch, so it may stay. A batch that lacks only the last line end is
            // complete.
            auto const now = disk_.identify(StoreFiles::text);
            mayBeComplete = now && now->isSameFile(before) && now->size + 1 >= before.size + lines.size();
            left = now.value_or(before);
        } catch (StoreError const&) {
            // It may be complete.
        }
        if (mayBeComplete) {
            rollBack(left, failure);
        }
        throw;
    }
}

void StoreWriter::rewrite(ProjectText next) {
    auto const before = seen_.identity();
    if (!isInPlace(before)) {
        throwReplaced();
    }
    auto const replacement = replace(next.body(), before);
    if (!replacement) {
        throwReplaced();
    }
    bool isStillInPlace = false;
    try {
        isStillInPlace = isInPlace(replacement->file.identity);
        if (isStillInPlace) {
            disk_.syncFolder();
        }
    } catch (StoreError const& failure) {
        rollBack(replacement->file.identity, failure);
        removeOwn(replacement->beside, replacement->besideIdentity);
        throw;
    }
    if (!isStillInPlace) {
        abandon(*replacement);
        throwReplaced();
    }
    removeOwn(replacement->beside, replacement->besideIdentity);
    seen_.replaced(std::move(next), replacement->file);
}

void StoreWriter::requireKnownOutcome() const {
    if (isOutcomeUnknown_) {
        throw StoreError(StoreError::Kind::Refused, StoreFiles::pathOfText(disk_), 0,
                         errorTexts.get("OutcomeUnknown"), errorTexts.get("ReopenAndCheck"));
    }
}

/// Writes a complete text and replaces the file that is expected at the text's name.
/// @return nothing if another file is there, which stays.
std::optional<StoreWriter::Replacement> StoreWriter::replace(std::string_view bytes,
                                                             FileIdentity const& expected) {
    auto name = StoreFiles::newTemporary();
    auto const file = disk_.create(name, bytes, StoreFiles::text);
    try {
        disk_.sync();
        auto const swapping = StoreFiles::swapping(expected, file.identity);
        if (!disk_.renameToFree(name, swapping)) {
            throw StoreError(StoreError::Kind::Damaged, disk_.folder() + "/" + swapping, 0,
                             errorTexts.get("NameNeeded"), errorTexts.get("RemedyOfNeededName"));
        }
        name = swapping;
        return exchange(name, file, expected);
    } catch (StoreError const&) {
        removeOwn(name, file.identity);
        throw;
    }
}

std::optional<StoreWriter::Replacement>
StoreWriter::exchange(std::string const& name, WrittenFile const& file, FileIdentity const& expected) {
    if (disk_.identify(StoreFiles::text) != expected) {
        removeOwn(name, file.identity);
        return std::nullopt;
    }
    Replacement result{file, name, expected, disk_.exchange(name, StoreFiles::text)};
    if (!result.isExchanged) {
        result.beside = StoreFiles::newTemporary();
        result.besideIdentity = disk_.create(result.beside, {}, std::nullopt).identity;
        if (identifyQuietly(StoreFiles::text) != expected) {
            removeOwn(result.beside, result.besideIdentity);
            removeOwn(name, file.identity);
            return std::nullopt;
        }
        disk_.rename(name, StoreFiles::text);
    } else if (!isExchangedWith(expected, name, file.identity)) {
        return std::nullopt;
    }
    // Renaming changes one of the file's times.
    auto const now = identifyQuietly(StoreFiles::text);
    bool const isKnown = now && now->isSameState(file.identity);
    result.file = {isKnown ? *now : file.identity, isKnown && file.isStamped};
    return result;
}

/// Checks that the file which an exchange moved to a name is the text that was read. Undoes the exchange if
/// it is another file or cannot be examined.
bool StoreWriter::isExchangedWith(FileIdentity const& expected, std::string const& name,
                                  FileIdentity const& ours) {
    std::optional<FileIdentity> old;
    try {
        old = disk_.identify(name);
    } catch (StoreError const&) {
        undoExchange(name, ours);
        throw;
    }
    bool const isExpected = old && old->isSameState(expected);
    if (!isExpected) {
        undoExchange(name, ours);
    }
    return isExpected;
}

/// Restores the file that another program put in place at the last moment.
void StoreWriter::undoExchange(std::string const& name, FileIdentity const& ours) {
    bool isRestored = false;
    try {
        isRestored = disk_.exchange(name, StoreFiles::text);
    } catch (StoreError const&) {
        // reported below
    }
    if (!isRestored) {
        throwNotRestored(name, ours);
    }
    try {
        disk_.syncFolder(); // otherwise a power failure could bring the batch back
    } catch (StoreError const& failure) {
        setOutcomeUnknown(ours);
        throw StoreError(StoreError::Kind::OutcomeUnknown, StoreFiles::pathOfText(disk_), 0,
                         errorTexts.get("OtherTextRestored", failure.problem()), reopenAfter(failure));
    }
    if (!removeOwn(name, ours)) {
        setAside(disk_, name); // another program has replaced it in between
    }
}

void StoreWriter::throwNotRestored(std::string const& name, FileIdentity const& ours) {
    setOutcomeUnknown(ours);
    std::string aside = name;
    try {
        aside = setAside(disk_, name);
    } catch (StoreError const&) {
        // It keeps its name, and the next writer restores it or sets it aside.
    }
    throw StoreError(StoreError::Kind::OutcomeUnknown, StoreFiles::pathOfText(disk_), 0,
                     errorTexts.get("OtherTextNotRestored", aside), errorTexts.get("RemedyOfNotRestored"));
}

/// The path leads elsewhere now. If the folder was moved away, the batch must not return with it.
void StoreWriter::abandon(Replacement const& replacement) {
    if (replacement.isExchanged && !disk_.isFolderInPlace()) {
        undoExchange(replacement.beside, replacement.file.identity);
    } else {
        removeOwn(replacement.beside, replacement.besideIdentity);
    }
}

/// Removes a batch that is in the text and may not be durable. The system's cached content of the file cannot
/// be trusted any more, so the text without the batch is written to a new file, byte for byte: conflict
/// markers and damage survive a write that failed.
void StoreWriter::rollBack(FileIdentity const& current, StoreError const& failure) {
    std::string reason = errorTexts.get("WrittenByProgram");
    try {
        auto before = seen_.text().bytes();
        if (auto const replacement = replace(before, current)) {
            disk_.syncFolder();
            removeOwn(replacement->beside, replacement->besideIdentity);
            seen_.replaced(*ProjectText::read(std::move(before), StoreFiles::pathOfText(disk_)),
                           replacement->file);
            return;
        }
        auto const there = identifyQuietly(StoreFiles::text);
        if (!there || !there->isSameFile(current)) {
            return; // another program's text, without the batch, has replaced it
        }
    } catch (StoreError const& second) {
        reason = second.problem();
    }
    setOutcomeUnknown(current);
    throw StoreError(StoreError::Kind::OutcomeUnknown, StoreFiles::pathOfText(disk_), 0,
                     errorTexts.get("RollbackFailed", failure.problem(), reason), reopenAfter(failure));
}

/// Makes this object refuse further writes. The system's cached content of the text may differ from the disk,
/// so no batch may be appended to this file: a torn tail makes the next writer create a new one.
void StoreWriter::setOutcomeUnknown(FileIdentity const& file) {
    isOutcomeUnknown_ = true;
    seen_.distrust();
    try {
        auto const there = disk_.identify(StoreFiles::text);
        if (there && there->isSameFile(file)) {
            disk_.append(StoreFiles::text, *there, "{");
        }
    } catch (StoreError const&) {
        // a disk that accepts no byte accepts no later batch either
    }
}

/// True if the path from the project's root leads to this file in the open folder, whatever its state.
bool StoreWriter::isInPlace(FileIdentity const& file) {
    if (!disk_.isFolderInPlace()) {
        return false;
    }
    auto const there = disk_.identifyByPath(StoreFiles::text);
    return there && there->isSameFile(file);
}

/// Empty also if the file cannot be examined.
std::optional<FileIdentity> StoreWriter::identifyQuietly(std::string const& name) {
    try {
        return disk_.identify(name);
    } catch (StoreError const&) {
        return std::nullopt;
    }
}

/// Deletes a file if it is the expected one. A file that cannot be deleted is left to the next writer.
/// @return false if it is another file.
bool StoreWriter::removeOwn(std::string const& name, FileIdentity const& ours) {
    try {
        auto const there = disk_.identify(name);
        if (!there || !there->isSameState(ours)) {
            return !there;
        }
        disk_.remove(name);
        return true;
    } catch (StoreError const&) {
        return false;
    }
}

void StoreWriter::throwReplaced() const {
    throw StoreError(StoreError::Kind::Busy, StoreFiles::pathOfText(disk_), 0,
                     errorTexts.get("ReplacedByProgram"), errorTexts.get("TryAgain"));
}

} // namespace project::stores
