#pragma once

#include <atomic>
#include <functional>
#include <mutex>
#include <thread>
#include <utility>

#include <unistd.h>

#include "cmlink/ReentrantReadWriteLock.hpp"
#include "support/Waiting.hpp"

namespace cmlink {

/// A thread of a test. The test can find out whether it waits. The destructor joins it.
class Worker {
public:
    explicit Worker(std::function<void()> work)
        : thread_([this, work = std::move(work)] {
              threadId_ = ::gettid();
              work();
              isDone_ = true;
          }) {}

    bool isDone() const { return isDone_; }

    /// Blocks until the thread sleeps or has ended. The system shows a thread that waits for a lock as
    /// asleep. A short sleep before does not count, because the thread must be asleep in many checks in a
    /// row.
    void untilItWaits() const {
        constexpr int enough = 50;
        for (int checks = 0; checks < enough && !isDone_; std::this_thread::yield()) {
            checks = project::test::isThreadAsleep(threadId_) ? checks + 1 : 0;
        }
    }

    void join() { thread_.join(); }

private:
    std::atomic<pid_t> threadId_ = 0;
    std::atomic<bool> isDone_ = false;
    std::jthread thread_;
};

/// A log of events, in order, written by any thread.
class Log {
public:
    void add(std::string event) {
        std::lock_guard const lock(mutex_);
        entries_.push_back(std::move(event));
    }

    std::vector<std::string> entries() const {
        std::lock_guard const lock(mutex_);
        return entries_;
    }

private:
    mutable std::mutex mutex_;
    std::vector<std::string> entries_;
};

/// Expects that the lock is free: another thread gets the write lock at once.
inline void expectFree(ReentrantReadWriteLock& lock) {
    Worker other([&] { auto const guard = lock.writeLock(); });
    other.untilItWaits();
    EXPECT_TRUE(other.isDone()) << "another thread still holds the lock";
}

/// Expects that another thread gets the read lock at once.
inline void expectOthersMayRead(ReentrantReadWriteLock& lock) {
    Worker other([&] { auto const guard = lock.readLock(); });
    other.untilItWaits();
    EXPECT_TRUE(other.isDone()) << "a reader is excluded";
}

} // namespace cmlink
