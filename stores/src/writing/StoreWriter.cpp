#include "writing/StoreWriter.hpp"

#include <utility>

#include "writing/Leftovers.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

namespace {

/// What to do when nobody can tell whether a batch is in the project.
std::string openAnewAfter(StoreError const& failure) {
    return failure.getRemedy() + (failure.getRemedy().empty() ? "" : " ") +
           "Then open the project anew, and look whether the last change is there.";
}

} // namespace

void StoreWriter::append(std::string_view lines) {
    auto const before = seen_.identity();
    if (!isInPlace(before)) {
        throwReplaced();
    }
    auto const written = appendOrTakeBack(lines, before);
    if (!written) {
        throwReplaced();
    }
    bool isStillInPlace = false;
    try {
        disk_.sync();
        isStillInPlace = isInPlace(before);
    } catch (StoreError const& failure) {
        takeBack(written->identity, failure);
        throw;
    }
    if (!isStillInPlace) {
        if (!disk_.isFolderInPlace()) {
            // It was moved away with the batch in it, which must not come back with it.
            takeBack(written->identity,
                     StoreError(StoreError::Kind::Busy, pathOfText(), 0, "was moved away", ""));
        }
        throwReplaced();
    }
    seen_.appended(lines, *written);
}

std::optional<WrittenFile> StoreWriter::appendOrTakeBack(std::string_view lines, FileIdentity const& before) {
    try {
        return disk_.append(StoreFiles::text, before, lines);
    } catch (StoreError const& failure) {
        auto left = before;
        bool mayCount = true;
        try {
            // A torn batch is counted by nobody and may stay. One that lacks just the last line's end is
            // whole.
            auto const now = disk_.identify(StoreFiles::text);
            mayCount = now && now->isSameFile(before) && now->size + 1 >= before.size + lines.size();
            left = now.value_or(before);
        } catch (StoreError const&) {
            // For all that can be known it is whole.
        }
        if (mayCount) {
            takeBack(left, failure);
        }
        throw;
    }
}

void StoreWriter::rewrite(ProjectText next) {
    auto const before = seen_.identity();
    if (!isInPlace(before)) {
        throwReplaced();
    }
    auto const replacement = put(next.body(), before);
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
        takeBack(replacement->file.identity, failure);
        removeOwn(replacement->beside, replacement->besideIdentity);
        throw;
    }
    if (!isStillInPlace) {
        withdraw(*replacement);
        throwReplaced();
    }
    removeOwn(replacement->beside, replacement->besideIdentity);
    seen_.replaced(std::move(next), replacement->file);
}

void StoreWriter::requireKnownOutcome() const {
    if (isOutcomeUnknown_) {
        throw StoreError(StoreError::Kind::Refused, pathOfText(), 0,
                         "is not written any more, since an earlier write failed so that nobody can tell "
                         "whether its batch is in the project",
                         "Open the project anew, and look whether the last change is there.");
    }
}

/// Writes a whole text and puts it in the place of the file that is expected there.
/// @return nothing when another file is there, which stays there.
std::optional<StoreWriter::Put> StoreWriter::put(std::string_view bytes, FileIdentity const& expected) {
    auto name = StoreFiles::newTemporary();
    auto const file = disk_.create(name, bytes, StoreFiles::text);
    try {
        disk_.sync();
        auto const swapping = StoreFiles::swapping(expected, file.identity);
        if (!disk_.renameToFree(name, swapping)) {
            throw StoreError(StoreError::Kind::Damaged, disk_.folder() + "/" + swapping, 0,
                             "stands in the way of a new text", "Move it away and try again.");
        }
        name = swapping;
        return swapIn(name, file, expected);
    } catch (StoreError const&) {
        removeOwn(name, file.identity);
        throw;
    }
}

std::optional<StoreWriter::Put> StoreWriter::swapIn(std::string const& name, WrittenFile const& file,
                                                    FileIdentity const& expected) {
    if (disk_.identify(StoreFiles::text) != expected) {
        removeOwn(name, file.identity);
        return std::nullopt;
    }
    Put result{file, name, expected, disk_.exchange(name, StoreFiles::text)};
    if (!result.isExchanged) {
        result.beside = StoreFiles::newTemporary();
        result.besideIdentity = disk_.create(result.beside, {}, std::nullopt).identity;
        if (identifyQuietly(StoreFiles::text) != expected) {
            removeOwn(result.beside, result.besideIdentity);
            removeOwn(name, file.identity);
            return std::nullopt;
        }
        disk_.rename(name, StoreFiles::text);
    } else if (!hasComeOut(name, expected, file.identity)) {
        return std::nullopt;
    }
    // A new name changes one of the file's times.
    auto const now = identifyQuietly(StoreFiles::text);
    bool const isKnown = now && now->isSameState(file.identity);
    result.file = {isKnown ? *now : file.identity, isKnown && file.isStamped};
    return result;
}

/// Looks whether an exchange has given a name to the text that was read; anything else goes back, and also
/// when the disk can't tell.
bool StoreWriter::hasComeOut(std::string const& name, FileIdentity const& expected,
                             FileIdentity const& ours) {
    std::optional<FileIdentity> old;
    try {
        old = disk_.identify(name);
    } catch (StoreError const&) {
        putBack(name, ours);
        throw;
    }
    bool const isExpected = old && old->isSameState(expected);
    if (!isExpected) {
        putBack(name, ours);
    }
    return isExpected;
}

/// What came out was not what was read: somebody put it there at the last moment, and it goes there again.
void StoreWriter::putBack(std::string const& name, FileIdentity const& ours) {
    bool isBack = false;
    try {
        isBack = disk_.exchange(name, StoreFiles::text);
    } catch (StoreError const&) {
        // told below
    }
    if (!isBack) {
        throwNotPutBack(name, ours);
    }
    try {
        disk_.syncFolder(); // or the batch could come back with a power cut
    } catch (StoreError const& failure) {
        loseTrack(ours);
        throw StoreError(StoreError::Kind::OutcomeUnknown, pathOfText(), 0,
                         failure.getProblem() + "; the text that stood there is back, but after a power cut "
                                                "nobody can tell whether the batch is in the project",
                         openAnewAfter(failure));
    }
    if (!removeOwn(name, ours)) {
        setAside(disk_, name); // yet another one came in between
    }
}

void StoreWriter::throwNotPutBack(std::string const& name, FileIdentity const& ours) {
    loseTrack(ours);
    std::string aside = name;
    try {
        aside = setAside(disk_, name);
    } catch (StoreError const&) {
        // It keeps the name that it has, and the next writer puts it back or sets it aside.
    }
    throw StoreError(
        StoreError::Kind::OutcomeUnknown, pathOfText(), 0,
        "was perhaps replaced by another program while a batch was written, and could not be put back: "
        "it is " +
            aside + " now, and the text in its place has the batch",
        "Compare the two files and keep what is right.");
}

/// The path leads elsewhere now. Where the folder was moved away, the batch must not come back with it.
void StoreWriter::withdraw(Put const& put) {
    if (put.isExchanged && !disk_.isFolderInPlace()) {
        putBack(put.beside, put.file.identity);
    } else {
        removeOwn(put.beside, put.besideIdentity);
    }
}

/// The batch stands in the text and may not be durable; what the system still holds of the file can't be
/// trusted after that. So the text without it is written to a new file, to the byte: where it has the markers
/// of a merge or damage, those are not gone with a write that failed.
void StoreWriter::takeBack(FileIdentity const& current, StoreError const& failure) {
    std::string reason = "another program wrote into it at the same time";
    try {
        auto before = seen_.text().bytes();
        if (auto const replacement = put(before, current)) {
            disk_.syncFolder();
            removeOwn(replacement->beside, replacement->besideIdentity);
            seen_.replaced(*ProjectText::read(std::move(before), pathOfText()), replacement->file);
            return;
        }
        auto const there = identifyQuietly(StoreFiles::text);
        if (!there || !there->isSameFile(current)) {
            return; // somebody else's text, without the batch, has taken its place
        }
    } catch (StoreError const& second) {
        reason = second.getProblem();
    }
    loseTrack(current);
    throw StoreError(StoreError::Kind::OutcomeUnknown, pathOfText(), 0,
                     failure.getProblem() + "; writing the text without the last batch failed too (" +
                         reason + "): nobody can tell whether the batch is in the project",
                     openAnewAfter(failure));
}

/// Nothing is written any more by this object. What the system holds of the text may differ from what is on
/// disk, and nothing may be appended to that: a torn tail makes whoever writes next write a new file.
void StoreWriter::loseTrack(FileIdentity const& file) {
    isOutcomeUnknown_ = true;
    seen_.distrust();
    try {
        auto const there = disk_.identify(StoreFiles::text);
        if (there && there->isSameFile(file)) {
            disk_.append(StoreFiles::text, *there, "{");
        }
    } catch (StoreError const&) {
        // a disk that takes nothing takes no later batch either
    }
}

/// True when the path from the project's root leads to this file in the open folder, whatever its state.
bool StoreWriter::isInPlace(FileIdentity const& file) {
    if (!disk_.isFolderInPlace()) {
        return false;
    }
    auto const there = disk_.identifyByPath(StoreFiles::text);
    return there && there->isSameFile(file);
}

/// Empty also when the disk can't tell.
std::optional<FileIdentity> StoreWriter::identifyQuietly(std::string const& name) {
    try {
        return disk_.identify(name);
    } catch (StoreError const&) {
        return std::nullopt;
    }
}

/// Removes a file if it is the one that is meant. What can't be removed is left to the next writer.
/// @return false when it is another one.
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

std::string StoreWriter::pathOfText() const {
    return disk_.folder() + "/" + StoreFiles::text;
}

void StoreWriter::throwReplaced() const {
    throw StoreError(
        StoreError::Kind::Busy, pathOfText(), 0,
        "was replaced, changed or moved by another program at this moment, and the batch is not in "
        "the project",
        "Try again.");
}

} // namespace project::stores
