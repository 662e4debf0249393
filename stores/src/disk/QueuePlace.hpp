#pragma once

#include <optional>

#include <sys/types.h>

namespace project::stores {

/// The order in which writers wait for the lock of a folder.
///
/// A place in the queue is a read lock on one byte of the folder. It belongs to the open folder, like the
/// lock of flock (fcntl, F_OFD_SETLK). Linux supports such locks on folders, although a folder has no bytes
/// to read: the queue therefore needs no file and no write permission, and the place of a process that dies
/// is free at once. A new writer takes the byte after the last one that is locked. Two writers that do so at
/// the same moment have the same byte, and only the lock itself decides between them.
///
/// The queue only orders the waiting writers. A file system without such locks has no queue; everything else
/// works there.
///
/// The order of use: take; then firstInFront as often as needed; the destructor releases the place.
class QueuePlace {
public:
    /// @param folder the open folder's descriptor, which outlives this.
    explicit QueuePlace(int folder) : folder_(folder) {}

    ~QueuePlace() { release(); }

    QueuePlace(QueuePlace const&) = delete;
    QueuePlace& operator=(QueuePlace const&) = delete;

    /// True if another open folder has a place. One system call.
    static bool isOccupied(int folder) noexcept;

    /// Takes the place after all others. Without effect if there can be no queue.
    void take() noexcept;

    void release() noexcept;

    /// The first place in the queue; empty if none is before this one.
    std::optional<off_t> firstInFront() const noexcept;

    /// The number of places from the given one to this one.
    off_t stepsBehind(off_t place) const noexcept { return place_.value_or(place) - place; }

    /// False if there is no queue.
    bool isTaken() const noexcept { return place_.has_value(); }

private:
    int folder_;
    std::optional<off_t> place_;
};

} // namespace project::stores
