#include "journal/UnfinishedCopy.hpp"

#include <array>
#include <chrono>

#include <xxhash.h>

#include "fl/i18n/Utf8.hpp"
#include "journal/CompleteFile.hpp"
#include "journal/LocationFile.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/TextBackend.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

constexpr char const* mark = "copying.old"; // source control ignores it as it does a file that was set aside
constexpr std::chrono::seconds patience{10};

/// The content of the mark while a file is in its present state. Empty if there is no such file.
std::string markFor(Disk& disk, std::string const& old) {
    auto const content = disk.read(old, 0);
    return content
               ? old + ' ' + std::to_string(XXH3_64bits(content->bytes.data(), content->bytes.size())) + '\n'
               : std::string();
}

} // namespace

FolderGuard::FolderGuard(Disk& disk) : disk_(disk) {
    if (!disk.lock(patience)) {
        throw StoreError(StoreError::Kind::Busy, disk.folder(), 0,
                         errorTexts.get("LockHeld", disk.lockHolder()), errorTexts.get("TryAgain"));
    }
}

FolderGuard::~FolderGuard() {
    disk_.unlock();
}

void markCopy(Disk& disk, std::string const& old) {
    disk.remove(mark);
    createComplete(disk, LocationFile::temporary, mark, markFor(disk, old));
    disk.syncFolder();
}

void removeCopyMark(Disk& disk) noexcept {
    try {
        disk.remove(mark);
    } catch (...) { // the next copy replaces it
    }
}

void finishCopy(Disk& disk, std::string const& old) {
    std::string aside = old + ".old";
    for (int number = 2; !disk.renameToFree(old, aside); ++number) {
        aside = old + ".old" + std::to_string(number);
    }
    disk.syncFolder();
    removeCopyMark(disk);
}

bool finishCopyOfOther(Disk& disk) {
    if (!disk.identify(mark)) {
        return false;
    }
    FolderGuard const guard(disk);
    auto const content = disk.read(mark, 0);
    if (!content) {
        return true; // the other process has finished its copy
    }
    std::array const names{fl::i18n::toUtf8(TextBackend::textName), std::string(LocationFile::name)};
    for (auto const& old : names) {
        if (content->bytes == markFor(disk, old)) {
            disk.syncFolder();
            finishCopy(disk, old);
            return true;
        }
    }
    return false;
}

} // namespace project::stores
