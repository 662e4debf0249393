#pragma once

#include <string>

namespace project::git {

/// Keeps git and everybody else from writing an index, in git's way: whoever makes the file "index.lock" may
/// write (git's Documentation/technical/api-lockfile). Held from before the index is read until the new one
/// stands, so that no change of somebody else is lost in between.
class IndexLock {
public:
    /// @throws GitError when somebody else holds the lock, or nobody may write there; its file is the lock
    /// file.
    explicit IndexLock(std::string index);

    /// Lets the lock go.
    ~IndexLock();
    IndexLock(IndexLock const&) = delete;
    IndexLock& operator=(IndexLock const&) = delete;

    /// Where the new index is prepared.
    std::string const& newIndex() const { return newIndex_; }

    /// Puts the prepared index in the place of the old one, whose permissions it gets.
    /// @throws GitError when that fails; the old one stays.
    void replaceIndex() const;

private:
    std::string index_;
    std::string lock_;
    std::string newIndex_;
};

} // namespace project::git
