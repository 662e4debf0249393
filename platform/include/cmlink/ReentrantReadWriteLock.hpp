#pragma once

#include <functional>
#include <memory>

#include "PlatformExport.hpp"

namespace cmlink {

/// A lock that many threads may hold to read or one to write, and that a holder may take again.
///
/// A thread that reads may read again, even while a writer waits; one that writes may take either again.
/// One that only reads and asks to write gets std::system_error with resource_deadlock_would_occur at once.
/// A thread that writes keeps the others out until it has released all its guards, in whatever order: a guard
/// to read that outlives the one to write does not let them in.
///
/// A waiting writer goes before readers that come later, so that readers do not starve it. The readers that
/// wait when a writer lets go are next, all together, before the next writer, so that writers do not starve
/// them. Between writers no order is promised.
///
/// Taking the lock again on a thread that holds it costs a few nanoseconds and touches no shared memory.
///
/// The lock must outlive its guards.
class PROJECT_PLATFORM_EXPORT ReentrantReadWriteLock {
public:
    enum class Access { Read, Write };

    /// What to do as the first guard of all threads is taken and after the last one was released. `first`
    /// runs on the thread that takes the guard, before any other thread gets one; what it throws reaches
    /// that thread, which then holds nothing, and the next one that comes is first again. `last` runs while
    /// nobody can take a guard, on the thread that released, and must not throw. Neither may take this lock.
    /// Between a `first` to write and its `last` one thread alone holds guards; between a `first` to read and
    /// its `last` only readers do.
    struct Hooks {
        std::function<void(Access)> first;
        std::function<void()> last;
    };

    class LockGuard;

    ReentrantReadWriteLock();
    explicit ReentrantReadWriteLock(Hooks hooks);
    ~ReentrantReadWriteLock();
    ReentrantReadWriteLock(ReentrantReadWriteLock const&) = delete;
    ReentrantReadWriteLock& operator=(ReentrantReadWriteLock const&) = delete;

    /// Blocks until this thread may read.
    LockGuard readLock();

    /// Blocks until this thread alone holds the lock.
    /// @throws std::system_error (resource_deadlock_would_occur) when this thread holds it only to read.
    LockGuard writeLock();

private:
    class State;

    LockGuard acquire(Access access);
    void release() noexcept;

    std::unique_ptr<State> state_;
};

/// Holds the lock for as long as it lives. It can be moved, but not to another thread: the thread that took
/// the lock must release it, or the program ends (std::terminate). A guard that was moved from holds nothing;
/// one that is assigned to releases what it held.
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
