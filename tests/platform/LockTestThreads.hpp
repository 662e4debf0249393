#pragma once

#include <array>
#include <atomic>
#include <cstdio>
#include <cstring>
#include <functional>
#include <mutex>
#include <thread>
#include <utility>

#include <fcntl.h>
#include <unistd.h>

#include "cmlink/ReentrantReadWriteLock.hpp"

namespace cmlink {

/// A thread of a test, of which the test can tell whether it waits. Joins when it goes.
class Worker {
public:
    explicit Worker(std::function<void()> work)
        : thread_([this, work = std::move(work)] {
              thread_id_ = ::gettid();
              work();
              done_ = true;
          }) {}

    bool isDone() const { return done_; }

    /// Blocks until the thread sleeps or is done. The system shows a thread that waits for a lock as asleep;
    /// many looks in a row keep a short sleep on the way there from counting.
    void untilItWaits() const {
        constexpr int enough = 50;
        for (int looks = 0; looks < enough && !done_; std::this_thread::yield()) {
            looks = isAsleep() ? looks + 1 : 0;
        }
    }

    void join() { thread_.join(); }

private:
    bool isAsleep() const {
        std::array<char, 64> name{};
        std::snprintf(name.data(), name.size(), "/proc/self/task/%d/stat", thread_id_.load());
        std::array<char, 64> line{};
        int const file = ::open(name.data(), O_RDONLY | O_CLOEXEC);
        auto const length = file < 0 ? -1 : ::read(file, line.data(), line.size() - 1);
        ::close(file);
        return length > 0 && std::strstr(line.data(), ") S ") != nullptr;
    }

    std::atomic<pid_t> thread_id_ = 0;
    std::atomic<bool> done_ = false;
    std::jthread thread_;
};

/// What happened, in order, told by any thread.
class Log {
public:
    void add(std::string what) {
        std::lock_guard const lock(mutex_);
        entries_.push_back(std::move(what));
    }

    std::vector<std::string> entries() const {
        std::lock_guard const lock(mutex_);
        return entries_;
    }

private:
    mutable std::mutex mutex_;
    std::vector<std::string> entries_;
};

/// Another thread gets in to write at once: nobody holds the lock.
inline void expectFree(ReentrantReadWriteLock& lock) {
    Worker other([&] { auto const guard = lock.writeLock(); });
    other.untilItWaits();
    EXPECT_TRUE(other.isDone()) << "somebody still holds the lock";
}

/// Another thread gets in to read at once.
inline void expectOthersMayRead(ReentrantReadWriteLock& lock) {
    Worker other([&] { auto const guard = lock.readLock(); });
    other.untilItWaits();
    EXPECT_TRUE(other.isDone()) << "a reader is kept out";
}

} // namespace cmlink
