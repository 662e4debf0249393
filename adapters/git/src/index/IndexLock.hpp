#pragma once

#include <string>

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

    /// The file for the new index.
    std::string const& newIndex() const { return newIndex_; }

    /// Replaces the old index by the new one, with the permissions of the old one.
    /// @throws GitError if that fails; the old index stays.
    void replaceIndex() const;

private:
    std::string index_;
    std::string lock_;
    std::string newIndex_;
};

} // namespace project::git
