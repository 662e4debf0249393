#pragma once

#include <functional>
#include <memory>

#include "PlatformExport.hpp"

namespace cmlink {

/// A lock that many threads may hold to read or one to write, and that a holder may take again.
///
/// A thread that reads may read again, even while a writer waits; one that writes may take either again.
/// One that only reads and asks to write gets std::system_error with resource_deadlock_would_occur at once.
/// Waiting writers go before readers that come later, so that they are not starved. Taking the lock again
/// on a thread that holds it costs a few nanoseconds and touches no shared memory.
///
/// The lock must outlive its guards.
class PROJECT_PLATFORM_EXPORT ReentrantReadWriteLock {
public:
    enum class Access { Read, Write };

    /// What to do as the first guard of all threads is taken and after the last one was released. `first`
    /// runs on the thread that takes the guard, before any other thread gets one; what it throws reaches
    /// that thread, which then holds nothing, and the next one that comes is first again. `last` runs while
    /// nobody can take a guard and must not throw. Neither may take this lock.
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

    void acquire(Access access);
    void release(Access access) noexcept;

    std::unique_ptr<State> state_;
};

/// Holds the lock for as long as it lives. It can be moved, but not to another thread: the thread that took
/// the lock must release it. A guard that was moved from holds nothing.
class PROJECT_PLATFORM_EXPORT ReentrantReadWriteLock::LockGuard {
public:
    LockGuard(LockGuard&& other) noexcept;
    LockGuard& operator=(LockGuard&& other) noexcept;
    LockGuard(LockGuard const&) = delete;
    LockGuard& operator=(LockGuard const&) = delete;
    ~LockGuard();

private:
    friend class ReentrantReadWriteLock;
    LockGuard(ReentrantReadWriteLock& lock, Access access) noexcept;

    ReentrantReadWriteLock* lock_;
    Access access_;
};

} // namespace cmlink
