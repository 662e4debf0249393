#pragma once

#include <functional>
#include <memory>

#include "PlatformExport.hpp"

namespace cmlink {

/// A lock that many threads may hold for reading, or one thread for writing. A thread that holds it may take
/// it again.
///
/// A thread with a read guard may take another read guard, even while a writer waits. A thread with a write
/// guard may take guards of both kinds. A thread with read guards only that requests a write guard gets
/// std::system_error with resource_deadlock_would_occur at once. A writer excludes other threads until it has
/// released all its guards, in any order: also a read guard that it releases last.
///
/// A waiting writer precedes the readers that arrive later, so that readers do not starve it. When a writer
/// releases the lock, all readers that are waiting then precede the next writer, so that writers do not
/// starve them. The order of writers is not specified.
///
/// Taking the lock again costs a few nanoseconds and does not access shared memory.
///
/// The lock must outlive its guards.
class PROJECT_PLATFORM_EXPORT ReentrantReadWriteLock {
public:
    /// The two kinds of guards.
    enum class Access { Read, Write };

    /// Functions that run when the process takes its first guard and when it releases its last one. `first`
    /// runs on the thread that takes the guard, before any other thread gets one. If it throws, the exception
    /// propagates to that thread, which then has no guard, and the next guard is the first one again. `last`
    /// runs on the thread that releases the guard, while no thread can take one, and must not throw. Neither
    /// may take this lock. Between a `first` for writing and its `last`, only one thread has guards; between
    /// a `first` for reading and its `last`, all guards are read guards.
    struct Hooks {
        std::function<void(Access)> first; ///< runs before the first guard
        std::function<void()> last;        ///< runs after the last guard
    };

    class LockGuard;

    ReentrantReadWriteLock();
    /// A lock with hooks, either of which may be empty.
    explicit ReentrantReadWriteLock(Hooks hooks);
    ~ReentrantReadWriteLock();
    ReentrantReadWriteLock(ReentrantReadWriteLock const&) = delete;
    ReentrantReadWriteLock& operator=(ReentrantReadWriteLock const&) = delete;

    /// Blocks until this thread may read, and returns the guard.
    LockGuard readLock();

    /// Blocks until this thread alone has the lock, and returns the guard.
    /// @throws std::system_error (resource_deadlock_would_occur) if this thread has read guards only.
    LockGuard writeLock();

private:
    class State;

    LockGuard acquire(Access access);
    void release() noexcept;

    std::unique_ptr<State> state_;
};

/// Holds the lock as long as it exists. It can be moved, but not to another thread: the thread that took the
/// lock must release it, or the program ends (std::terminate). A guard that was moved from does not hold the
/// lock. An assignment to a guard first releases the lock that it holds.
class PROJECT_PLATFORM_EXPORT ReentrantReadWriteLock::LockGuard {
public:
    LockGuard(LockGuard&& other) noexcept;
    LockGuard& operator=(LockGuard&& other) noexcept;
    LockGuard(LockGuard const&) = delete;
    LockGuard& operator=(LockGuard const&) = delete;
    ~LockGuard();

private:
    friend class ReentrantReadWriteLock;
    explicit LockGuard(ReentrantReadWriteLock& lock) noexcept;

    ReentrantReadWriteLock* lock_;
};

} // namespace cmlink
