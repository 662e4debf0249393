#include "DiskEntries.hpp"

#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <set>
#include <string>
#include <system_error>

#include <fcntl.h>
#include <unistd.h>

#include "fl/filesystem/SystemName.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace project::session {

using fl::filesystem::SystemName;
using metadata::getParentFolder;
using Reason = MoveError::Reason;

namespace {

/// Whether a folder lists this very name. A file that has two names on a file system that distinguishes them
/// is found under both.
bool isListed(Path const& path) {
    auto const name = fl::filesystem::toSystem(path).filename();
    std::error_code error;
    for (auto const& entry :
         std::filesystem::directory_iterator(fl::filesystem::toSystem(getParentFolder(path)), error)) {
        if (entry.path().filename() == name) {
            return true;
        }
    }
    return static_cast<bool>(error);
}

[[noreturn]] void throwFailed(Move const& move, int error) {
    switch (error) {
    case EEXIST:
    case ENOTEMPTY:
        throw MoveError(Reason::Exists, move);
    case ENOENT:
        throw MoveError(Reason::IsMissing, move);
    case EXDEV:
        throw MoveError(Reason::IsOtherFileSystem, move);
    default:
        throw MoveError(Reason::DiskFailed, move, std::generic_category().message(error));
    }
}

bool isUnsupported(int error) {
    return error == ENOSYS || error == EINVAL || error == EOPNOTSUPP;
}

} // namespace

std::optional<struct stat> diskEntry(Path const& path) {
    struct stat found {};

    SystemName const name(path);
    return name.get() != nullptr && ::lstat(name.get(), &found) == 0 ? std::optional(found) : std::nullopt;
}

bool isFree(Move const& move) {
    auto const there = diskEntry(move.to);
    if (!there) {
        return true;
    }
    auto const here = diskEntry(move.from);
    bool const isSame = here && here->st_dev == there->st_dev && here->st_ino == there->st_ino;
    return isSame && !isListed(move.to);
}

void moveOnDisk(Move const& move) {
    SystemName const from(move.from);
    SystemName const to(move.to);
    if (from.get() == nullptr || to.get() == nullptr) {
        throwFailed(move, ENAMETOOLONG);
    }
    if (!isFree(move)) {
        throw MoveError(Reason::Exists, move);
    }
    bool const isOtherCase = diskEntry(move.to).has_value();
    if (!isOtherCase && ::renameat2(AT_FDCWD, from.get(), AT_FDCWD, to.get(), RENAME_NOREPLACE) == 0) {
        return;
    }
    if (!isOtherCase && !isUnsupported(errno)) {
        throwFailed(move, errno);
    }
    if (std::rename(from.get(), to.get()) != 0) {
        throwFailed(move, errno);
    }
}

void syncNames(std::vector<Move> const& moves) {
    std::set<Path> synced;
    for (auto const& move : moves) {
        for (auto const& path : {move.from, move.to}) {
            auto const folder = getParentFolder(path);
            if (!synced.insert(folder).second) {
                continue;
            }
            SystemName const name(folder);
            int const open = ::open(name.get(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
            bool const isSynced = open >= 0 && ::fsync(open) == 0;
            int const error = errno;
            if (open >= 0) {
                ::close(open);
            }
            if (!isSynced && !isUnsupported(error)) { // some file systems cannot sync a folder
                throwFailed(move, error);
            }
        }
    }
}

} // namespace project::session
