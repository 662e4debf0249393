#include "states/EntryComparison.hpp"

#include <tuple>

#include "repository/LibGit.hpp"
#include "states/ContentIds.hpp"

namespace project::git {

namespace {

constexpr std::uint32_t executable = 0100;

git_index_time timeOf(struct timespec const& time) {
    return {static_cast<std::int32_t>(time.tv_sec), static_cast<std::uint32_t>(time.tv_nsec)};
}

/// Programs without nanoseconds write 0.
bool isSame(git_index_time const& recorded, git_index_time const& found) {
    return recorded.seconds == found.seconds &&
           (recorded.nanoseconds == 0 || recorded.nanoseconds == found.nanoseconds);
}

bool isAsYoungAs(git_index_entry const& entry, FileStamp const& index) {
    std::int64_t const seconds = entry.mtime.seconds;
    if (entry.mtime.nanoseconds == 0) {
        return seconds >= index.seconds;
    }
    return std::tuple(seconds, std::int64_t{entry.mtime.nanoseconds}) >=
           std::tuple(index.seconds, index.nanoseconds);
}

} // namespace

bool EntryComparison::isModified(git_index_entry const& entry, struct stat const& onDisk) {
    if (entry.mode != modeOf(onDisk, &entry, repository_.settings())) {
        return true;
    }
    if (!isTouched(entry, onDisk) && !isAsYoungAs(entry, repository_.indexStamp())) {
        return false;
    }
    return isContentModified(entry, onDisk);
}

/// A size of 0 also marks an entry that has to be compared by content.
bool EntryComparison::isTouched(git_index_entry const& entry, struct stat const& onDisk) const {
    git_index_entry found{};
    record(onDisk, found);
    return !isSame(entry.mtime, found.mtime) || !isSame(entry.ctime, found.ctime) || entry.ino != found.ino ||
           entry.uid != found.uid || entry.gid != found.gid || entry.file_size != found.file_size ||
           entry.file_size == 0;
}

bool EntryComparison::isContentModified(git_index_entry const& entry, struct stat const& onDisk) {
    if (entry.file_size != 0 && entry.file_size != static_cast<std::uint32_t>(onDisk.st_size)) {
        return true; // even if a filter would restore the size: git does not check that either
    }
    git_oid content{};
    bool const isRead = hashOnDisk(content, repository_, rules_, entry.path, onDisk);
    return !isRead || libgit().git_oid_equal(&content, &entry.id) == 0;
}

std::uint32_t modeOf(struct stat const& onDisk, git_index_entry const* tracked,
                     DiskSettings const& settings) {
    if (S_ISLNK(onDisk.st_mode)) {
        return GIT_FILEMODE_LINK;
    }
    auto const recorded = tracked == nullptr ? std::uint32_t{GIT_FILEMODE_BLOB} : tracked->mode;
    if (recorded == GIT_FILEMODE_LINK && !settings.hasLinks) {
        return GIT_FILEMODE_LINK;
    }
    if (!settings.hasExecutableBit) {
        return recorded == GIT_FILEMODE_BLOB_EXECUTABLE ? recorded : std::uint32_t{GIT_FILEMODE_BLOB};
    }
    return (onDisk.st_mode & executable) != 0 ? GIT_FILEMODE_BLOB_EXECUTABLE : GIT_FILEMODE_BLOB;
}

void record(struct stat const& onDisk, git_index_entry& entry) {
    entry.ctime = timeOf(onDisk.st_ctim);
    entry.mtime = timeOf(onDisk.st_mtim);
    entry.dev = static_cast<std::uint32_t>(onDisk.st_dev);
    entry.ino = static_cast<std::uint32_t>(onDisk.st_ino);
    entry.uid = static_cast<std::uint32_t>(onDisk.st_uid);
    entry.gid = static_cast<std::uint32_t>(onDisk.st_gid);
    entry.file_size = static_cast<std::uint32_t>(onDisk.st_size);
}

} // namespace project::git
