#include "project/stores/StoreCopy.hpp"

#include <algorithm>
#include <array>
#include <string_view>

#include "journal/CompleteFile.hpp"
#include "journal/LocationFile.hpp"
#include "journal/UnfinishedCopy.hpp"
#include "project/stores/StoreError.hpp"
#include "text/ProjectText.hpp"
#include "texts/ErrorTexts.hpp"
#include "writing/StoreFiles.hpp"

namespace project::stores {

namespace {

/// Both kinds of store leave files that source control ignores. A file that somebody has edited stays.
void ignoreFilesOfBothKinds(Disk& disk, FileChanges& changes) {
    auto const now = disk.read(LocationFile::ignored, 0);
    std::string const wanted =
        std::string(StoreFiles::ignoredOfText) + std::string(LocationFile::ignoredContent);
    // A store from before there were personal texts does not name their folder.
    std::array const ours{StoreFiles::ignoredContent, StoreFiles::ignoredOfText, LocationFile::ignoredContent,
                          LocationFile::ignoredOfLocation};
    bool const isOurs = !now || std::ranges::find(ours, now->bytes) != ours.end();
    if (isOurs) {
        disk.remove(LocationFile::temporary);
        disk.create(LocationFile::temporary, wanted, std::nullopt);
        disk.sync();
        disk.rename(LocationFile::temporary, LocationFile::ignored);
        changes.added.push_back(pathIn(disk, LocationFile::ignored));
    }
}

[[noreturn]] void throwTaken(Disk const& disk, char const* name) {
    throw StoreError(StoreError::Kind::Refused, disk.folder() + '/' + name, 0,
                     errorTexts.get("ExistsAlready"), errorTexts.get("RemedyOfExisting"));
}

/// Deletes the new file again, unless the old one was set aside already.
/// @return false if the folder may contain the new one, also after a power failure.
bool takeBack(Disk& disk, char const* fresh, char const* old) noexcept {
    try {
        if (!disk.identify(old)) {
            return false;
        }
        disk.remove(fresh);
        disk.syncFolder();
        removeCopyMark(disk);
        return true;
    } catch (...) {
        return false;
    }
}

/// Gives the folder a new file for its definition, and sets the old one aside.
void exchange(Disk& disk, std::string const& temporary, char const* fresh, std::string_view content,
              char const* old, FileChanges& changes) {
    markCopy(disk, old);
    if (!createComplete(disk, temporary, fresh, content)) {
        throwTaken(disk, fresh);
    }
    try {
        disk.syncFolder(); // otherwise a power failure could leave neither of the files
        finishCopy(disk, old);
    } catch (StoreError const& error) {
        if (takeBack(disk, fresh, old)) {
            throw;
        }
        throw StoreError(StoreError::Kind::OutcomeUnknown, error.file(), 0,
                         errorTexts.get("CopyUncertain", error.problem()),
                         errorTexts.get("RemedyOfUncertainCopy"));
    }
    changes.added.push_back(pathIn(disk, fresh));
    changes.removed.push_back(pathIn(disk, old));
}

} // namespace

std::string canonicalText(Disk& disk) {
    auto const content = disk.openFolder() ? disk.read(StoreFiles::text, 0) : std::nullopt;
    auto const file = StoreFiles::pathOfText(disk);
    auto const text = content ? ProjectText::read(content->bytes, file) : std::nullopt;
    if (!text || text->hasFault(Fault::Kind::Damage) || text->hasFault(Fault::Kind::Conflict)) {
        throw StoreError(StoreError::Kind::Damaged, file, 0, errorTexts.get("CopyOfFaulty"),
                         errorTexts.get("RemedyOfFaultyCopy"));
    }
    return text->rewrittenWith({}).body();
}

FileChanges replaceTextByLocation(Disk& disk, SharedLocation const& location) {
    FileChanges changes;
    ignoreFilesOfBothKinds(disk, changes);
    exchange(disk, LocationFile::temporary, LocationFile::name, LocationFile::contentOf(location),
             StoreFiles::text, changes);
    return changes;
}

FileChanges replaceLocationByText(Disk& disk, std::string_view text) {
    FileChanges changes;
    if (!disk.openFolder()) {
        throw StoreError(StoreError::Kind::Refused, disk.folder(), 0, errorTexts.get("DoesNotExist"), "");
    }
    FolderGuard const guard(disk);
    ignoreFilesOfBothKinds(disk, changes);
    if (createComplete(disk, StoreFiles::newTemporary(), StoreFiles::attributes,
                       StoreFiles::attributesContent)) {
        changes.added.push_back(pathIn(disk, StoreFiles::attributes));
    }
    exchange(disk, StoreFiles::newTemporary(), StoreFiles::text, text, LocationFile::name, changes);
    return changes;
}

} // namespace project::stores
