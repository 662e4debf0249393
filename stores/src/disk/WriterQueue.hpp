#pragma once

#include <optional>

#include <sys/types.h>

namespace project::stores {

/// The order in which writers wait for the lock of a folder.
///
/// A place in the queue is a read lock on one byte of the folder that belongs to the open folder, as flock's
/// lock does (fcntl, F_OFD_SETLK). Linux keeps such locks for folders too, though no byte is there to be
/// read: so no file is made for the queue, a project that may not be written needs none, and the place of a
/// process that dies is free at once. A newcomer takes the byte behind the last one that anybody holds. Two
/// that do so at the same moment have the same byte, and only the lock itself decides between them.
///
/// The queue only orders those who wait. A file system without such locks has no queue, and nothing else is
/// amiss there.
///
/// The order of use: take; then firstInFront as often as needed; the place is let go with the object.
class QueuePlace {
public:
    /// @param folder the open folder's descriptor, which outlives this.
    explicit QueuePlace(int folder) : folder_(folder) {}

    ~QueuePlace() { letGo(); }

    QueuePlace(QueuePlace const&) = delete;
    QueuePlace& operator=(QueuePlace const&) = delete;

    /// True when others than this open folder have a place. One system call.
    static bool isAnybodyIn(int folder) noexcept;

    /// Takes the place behind all others. Without effect where there can be no queue.
    void take() noexcept;

    void letGo() noexcept;

    /// The place of whoever is first of those in front of this one; empty when nobody is in front.
    std::optional<off_t> firstInFront() const noexcept;

    /// How far behind a place this one is, in places.
    off_t stepsBehind(off_t place) const noexcept { return place_.value_or(place) - place; }

    /// False where there is no queue.
    bool isTaken() const noexcept { return place_.has_value(); }

private:
    int folder_;
    std::optional<off_t> place_;
};

} // namespace project::stores
