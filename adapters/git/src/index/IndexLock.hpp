#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "repository/FileStamp.hpp"

namespace project::git {

/// Excludes git and other programs from writing an index, as git does: the process that creates the file
/// "index.lock" holds the lock (git's Documentation/technical/api-lockfile). It is held from before the index
/// is read until the new one is in place, so that changes of other programs are not lost.
class IndexLock {
public:
    /// @throws GitError if another process holds the lock, or the lock file cannot be created; the error's
    /// file is the lock file.
    explicit IndexLock(std::string index);

    /// Releases the lock.
    ~IndexLock();
    IndexLock(IndexLock const&) = delete;
    IndexLock& operator=(IndexLock const&) = delete;

    /// Reserves space on the disk for a new index, if the disk can do that.
    /// @throws GitError if there is no space.
    void reserve(std::size_t size) const;

    /// Replaces the old index by a new one, with the permissions of the old one.
    /// @return the stamp of the new one.
    /// @throws GitError if that fails; the old index stays.
    FileStamp replaceIndex(std::string_view content) const;

private:
    std::string index_;
    std::string lock_;
    std::string newIndex_;
};

} // namespace project::git
