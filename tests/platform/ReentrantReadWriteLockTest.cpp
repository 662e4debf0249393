#include "cmlink/ReentrantReadWriteLock.hpp"

#include <array>
#include <atomic>
#include <cstdio>
#include <cstring>
#include <functional>
#include <latch>
#include <mutex>
#include <optional>
#include <stdexcept>
#include <system_error>
#include <thread>
#include <utility>

#include <fcntl.h>
#include <unistd.h>

namespace cmlink {

namespace {

using Access = ReentrantReadWriteLock::Access;
using Lock = ReentrantReadWriteLock;

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

Lock::Hooks hooksThatTell(Log& log) {
    return {[&log](Access access) { log.add(access == Access::Read ? "first reads" : "first writes"); },
            [&log] { log.add("last"); }};
}

using Guard = Lock::LockGuard;

/// Another thread gets in to write at once: nobody holds the lock.
void expectFree(Lock& lock) {
    Worker other([&] { auto const guard = lock.writeLock(); });
    other.untilItWaits();
    EXPECT_TRUE(other.isDone()) << "somebody still holds the lock";
}

/// Another thread gets in to read at once.
void expectOthersMayRead(Lock& lock) {
    Worker other([&] { auto const guard = lock.readLock(); });
    other.untilItWaits();
    EXPECT_TRUE(other.isDone()) << "a reader is kept out";
}

using Entry = Guard (Lock::*)();

std::errc errorOf(std::function<void()> const& action) {
    try {
        action();
    } catch (std::system_error const& error) {
        return static_cast<std::errc>(error.code().value());
    }
    return {};
}

} // namespace

TEST(ReentrantReadWriteLock, aReaderLetsOthersReadAndNotWrite) {
    Lock lock;
    Log log;
    auto reading = std::make_optional(lock.readLock());

    expectOthersMayRead(lock);
    Worker writer([&] {
        auto const guard = lock.writeLock();
        log.add("writer in");
    });
    writer.untilItWaits();
    log.add("reader out");
    reading.reset();
    writer.join();

    EXPECT_EQ(log.entries(), (std::vector<std::string>{"reader out", "writer in"}));
}

TEST(ReentrantReadWriteLock, aWriterKeepsReadersAndWritersOut) {
    for (Entry const enter : {&Lock::readLock, &Lock::writeLock}) {
        Lock lock;
        Log log;
        auto writing = std::make_optional(lock.writeLock());

        Worker other([&] {
            auto const guard = (lock.*enter)();
            log.add("other in");
        });
        other.untilItWaits();
        log.add("writer out");
        writing.reset();
        other.join();

        EXPECT_EQ(log.entries(), (std::vector<std::string>{"writer out", "other in"}));
    }
}

TEST(ReentrantReadWriteLock, isFreeOnlyAfterTheOuterGuardHasGone) {
    std::vector<std::pair<Entry, Entry>> const nestings = {{&Lock::readLock, &Lock::readLock},
                                                           {&Lock::writeLock, &Lock::readLock},
                                                           {&Lock::writeLock, &Lock::writeLock}};
    for (auto const& [outer, inner] : nestings) {
        Lock lock;
        auto outerGuard = std::make_optional((lock.*outer)());
        auto innerGuard = std::make_optional((lock.*inner)());

        innerGuard.reset();
        Worker other([&] { auto const guard = lock.writeLock(); });
        other.untilItWaits();
        EXPECT_FALSE(other.isDone());

        outerGuard.reset();
        other.join();
        EXPECT_TRUE(other.isDone());
    }
}

TEST(ReentrantReadWriteLock, aWriterKeepsOthersOutUntilItsLastGuardHasGoneWhicheverThatIs) {
    Lock lock;
    auto writing = std::make_optional(lock.writeLock());
    auto reading = std::make_optional(lock.readLock());

    writing.reset();
    Worker other([&] { auto const guard = lock.readLock(); });
    other.untilItWaits();
    EXPECT_FALSE(other.isDone());
    EXPECT_NO_THROW(lock.writeLock());

    reading.reset();
    other.join();
    expectFree(lock);
}

TEST(ReentrantReadWriteLock, aReaderThatAsksToWriteIsRefusedAtOnceAndReadsOn) {
    Lock lock;
    auto outer = std::make_optional(lock.readLock());
    auto inner = std::make_optional(lock.readLock());

    EXPECT_EQ(errorOf([&] { lock.writeLock(); }), std::errc::resource_deadlock_would_occur);

    expectOthersMayRead(lock);
    Worker writer([&] { auto const guard = lock.writeLock(); });
    writer.untilItWaits();
    EXPECT_FALSE(writer.isDone());
    EXPECT_EQ(errorOf([&] { lock.writeLock(); }), std::errc::resource_deadlock_would_occur);
    inner.reset();
    outer.reset();
    writer.join();
    EXPECT_NO_THROW(lock.writeLock());
}

TEST(ReentrantReadWriteLock, aThreadThatReadsGetsInAgainWhileAWriterWaits) {
    Lock lock;
    auto outer = std::make_optional(lock.readLock());
    Worker writer([&] { auto const guard = lock.writeLock(); });
    writer.untilItWaits();

    auto inner = std::make_optional(lock.readLock());

    EXPECT_FALSE(writer.isDone());
    inner.reset();
    outer.reset();
}

TEST(ReentrantReadWriteLock, aWaitingWriterGoesBeforeAReaderThatComesLater) {
    Lock lock;
    Log log;
    auto reading = std::make_optional(lock.readLock());
    Worker writer([&] {
        auto const guard = lock.writeLock();
        log.add("writer");
    });
    writer.untilItWaits();
    Worker reader([&] {
        auto const guard = lock.readLock();
        log.add("reader");
    });
    reader.untilItWaits();

    EXPECT_TRUE(log.entries().empty());
    reading.reset();
    writer.join();
    reader.join();

    EXPECT_EQ(log.entries(), (std::vector<std::string>{"writer", "reader"}));
}

TEST(ReentrantReadWriteLock, readersThatWaitAreNextWhenAWriterLetsGo) {
    Lock lock;
    Log log;
    auto writing = std::make_optional(lock.writeLock());
    Worker writer([&] {
        auto const guard = lock.writeLock();
        log.add("writer");
    });
    writer.untilItWaits();
    auto const read = [&] {
        auto const guard = lock.readLock();
        log.add("reader");
    };
    Worker oneReader(read);
    Worker otherReader(read);
    oneReader.untilItWaits();
    otherReader.untilItWaits();

    writing.reset();
    writer.join();
    oneReader.join();
    otherReader.join();

    EXPECT_EQ(log.entries(), (std::vector<std::string>{"reader", "reader", "writer"}));
}

TEST(ReentrantReadWriteLock, aWriterThatComesAgainGoesAfterTheReadersThatWaitedForIt) {
    Lock lock;
    Log log;
    auto writing = std::make_optional(lock.writeLock());
    auto const read = [&] {
        auto const guard = lock.readLock();
        log.add("reader");
    };
    Worker oneReader(read);
    Worker otherReader(read);
    oneReader.untilItWaits();
    otherReader.untilItWaits();

    writing.reset();
    writing.emplace(lock.writeLock());
    log.add("writer again");
    writing.reset();

    EXPECT_EQ(log.entries(), (std::vector<std::string>{"reader", "reader", "writer again"}));
}

TEST(ReentrantReadWriteLock, aStreamOfReadersDoesNotStarveAWriter) {
    Lock lock;
    std::atomic<bool> hasWritten = false;
    std::latch allRead(4);
    auto const readOnAndOn = [&] {
        auto guard = std::make_optional(lock.readLock());
        allRead.arrive_and_wait();
        while (!hasWritten) {
            std::this_thread::yield(); // while holding it, so that the turns of the threads overlap
            guard.reset();
            guard.emplace(lock.readLock());
        }
    };
    std::array<Worker, 3> const readers = {Worker(readOnAndOn), Worker(readOnAndOn), Worker(readOnAndOn)};
    allRead.arrive_and_wait();

    auto const guard = lock.writeLock();

    hasWritten = true;
}

TEST(ReentrantReadWriteLock, aStreamOfWritersDoesNotStarveAReader) {
    Lock lock;
    std::atomic<bool> hasRead = false;
    auto const writeOnAndOn = [&] {
        while (!hasRead) {
            auto const guard = lock.writeLock();
        }
    };
    Worker one(writeOnAndOn);
    Worker other(writeOnAndOn);

    auto const guard = lock.readLock();

    hasRead = true;
}

TEST(ReentrantReadWriteLock, manyThreadsNeverSeeAHalfDoneChange) {
    constexpr int rounds = 2000;
    constexpr int writers = 3;
    Lock lock;
    int left = 0;
    int right = 0;
    std::atomic<int> torn = 0;
    auto const write = [&] {
        for (int round = 0; round < rounds; ++round) {
            auto const outer = lock.writeLock();
            ++left;
            auto const inner = lock.readLock();
            ++right;
        }
    };
    auto const read = [&] {
        for (int round = 0; round < rounds; ++round) {
            auto const outer = lock.readLock();
            auto const before = left;
            auto const inner = lock.readLock();
            torn += before == right ? 0 : 1;
        }
    };

    {
        std::vector<std::jthread> threads;
        for (int writer = 0; writer < writers; ++writer) {
            threads.emplace_back(write);
            threads.emplace_back(read);
        }
    }

    EXPECT_EQ(torn, 0);
    EXPECT_EQ(left, writers * rounds);
    EXPECT_EQ(right, writers * rounds);
}

TEST(ReentrantReadWriteLock, oneThreadMayHoldManyLocksAndReleaseThemInAnyOrder) {
    std::array<Lock, 20> locks;
    std::vector<Guard> guards;
    for (auto& lock : locks) {
        guards.push_back(lock.writeLock());
        guards.push_back(lock.readLock());
    }

    while (!guards.empty()) {
        guards.erase(guards.begin() + static_cast<std::ptrdiff_t>(guards.size() / 2));
    }

    for (auto& lock : locks) {
        expectFree(lock);
    }
}

TEST(ReentrantReadWriteLock, aLockMadeWhereAnotherOneWasKnowsNothingOfIt) {
    Lock beside;
    auto const held = beside.readLock();
    std::optional<Lock> lock;
    for (int round = 0; round < 3; ++round) {
        lock.emplace();
        { auto const reading = lock->readLock(); }
        lock.emplace();

        EXPECT_NO_THROW(lock->writeLock());
        expectFree(*lock);
    }
}

TEST(LockGuard, movingItHandsTheLockOn) {
    Lock lock;
    auto writing = std::make_optional(lock.writeLock());

    auto moved = std::make_optional(std::move(*writing));
    writing.reset();
    Worker other([&] { auto const guard = lock.readLock(); });
    other.untilItWaits();
    EXPECT_FALSE(other.isDone()) << "the guard that was moved from released the lock";

    moved.reset();
    other.join();
    expectFree(lock);
}

TEST(LockGuard, assigningReleasesWhatWasHeld) {
    Lock left;
    Lock right;
    auto guard = std::make_optional(left.writeLock());

    *guard = right.writeLock();

    expectFree(left);
    Worker other([&] { auto const waiting = right.readLock(); });
    other.untilItWaits();
    EXPECT_FALSE(other.isDone());
    guard.reset();
    other.join();
}

TEST(LockGuard, assigningItToItselfKeepsTheLock) {
    Lock lock;
    auto guard = std::make_optional(lock.writeLock());
    auto& same = *guard;

    *guard = std::move(same);

    Worker other([&] { auto const waiting = lock.readLock(); });
    other.untilItWaits();
    EXPECT_FALSE(other.isDone());
    guard.reset();
    other.join();
}

TEST(LockGuard, oneThatWasMovedFromCanBeAssignedTo) {
    Lock lock;
    auto first = lock.readLock();
    auto second = std::make_optional(std::move(first));

    first = lock.readLock();
    second.reset();

    EXPECT_EQ(errorOf([&] { lock.writeLock(); }), std::errc::resource_deadlock_would_occur);
    expectOthersMayRead(lock);
}

TEST(LockGuardDeathTest, releasingItOnAnotherThreadEndsTheProgram) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_DEATH(
        {
            Lock lock;
            auto guard = std::make_optional(lock.readLock());
            std::jthread([&] { guard.reset(); });
        },
        "");
}

TEST(LockHooks, runForTheFirstGuardAndTheLastAndNotInBetween) {
    Log log;
    Lock lock(hooksThatTell(log));
    auto outer = std::make_optional(lock.writeLock());
    {
        auto const inner = lock.writeLock();
        auto const reading = lock.readLock();
    }
    log.add("inner out");
    outer.reset();

    EXPECT_EQ(log.entries(), (std::vector<std::string>{"first writes", "inner out", "last"}));
}

TEST(LockHooks, runOnceForReadersThatShare) {
    Log log;
    Lock lock(hooksThatTell(log));
    auto reading = std::make_optional(lock.readLock());
    expectOthersMayRead(lock);
    log.add("other out");
    reading.reset();

    EXPECT_EQ(log.entries(), (std::vector<std::string>{"first reads", "other out", "last"}));
}

TEST(LockHooks, theReaderThatGoesLastRunsLastThoughItWasNotFirst) {
    Log log;
    Lock lock(hooksThatTell(log));
    auto first = std::make_optional(lock.readLock());
    std::latch isIn(1);
    std::latch mayGo(1);
    Worker second([&] {
        auto const guard = lock.readLock();
        isIn.count_down();
        mayGo.wait();
    });
    isIn.wait();

    first.reset();
    log.add("first out");
    mayGo.count_down();
    second.join();

    EXPECT_EQ(log.entries(), (std::vector<std::string>{"first reads", "first out", "last"}));
}

TEST(LockHooks, eachHandOverBetweenThreadsThatExcludeEachOtherIsALastAndAFirst) {
    Log log;
    Lock lock(hooksThatTell(log));
    auto writing = std::make_optional(lock.writeLock());
    Worker writer([&] { auto const guard = lock.writeLock(); });
    writer.untilItWaits();
    Worker reader([&] { auto const guard = lock.readLock(); });
    reader.untilItWaits();

    writing.reset();
    writer.join();
    reader.join();

    EXPECT_EQ(log.entries(), (std::vector<std::string>{"first writes", "last", "first reads", "last",
                                                       "first writes", "last"}));
}

TEST(LockHooks, othersWaitWhileFirstRuns) {
    for (Entry const enter : {&Lock::readLock, &Lock::writeLock}) {
        Log log;
        std::latch isInFirst(1);
        std::latch mayGoOn(1);
        std::atomic<int> calls = 0;
        Lock lock({[&](Access) {
                       if (calls++ == 0) {
                           isInFirst.count_down();
                           mayGoOn.wait();
                           log.add("first done");
                       }
                   },
                   {}});
        Worker slow([&] { auto const guard = lock.readLock(); });
        isInFirst.wait();
        Worker other([&] {
            auto const guard = (lock.*enter)();
            log.add("other in");
        });
        other.untilItWaits();

        mayGoOn.count_down();
        slow.join();
        other.join();

        EXPECT_EQ(log.entries(), (std::vector<std::string>{"first done", "other in"}));
    }
}

TEST(LockHooks, readersThatWaitedForFirstGetInBesideTheOneThatRanIt) {
    std::latch isInFirst(1);
    std::latch mayGoOn(1);
    Lock lock({[&](Access) {
                   isInFirst.count_down();
                   mayGoOn.wait();
               },
               {}});
    std::latch otherIsIn(1);
    Worker slow([&] {
        auto const guard = lock.readLock();
        otherIsIn.wait();
    });
    isInFirst.wait();
    Worker other([&] {
        auto const guard = lock.readLock();
        otherIsIn.count_down();
    });
    other.untilItWaits();

    mayGoOn.count_down();
    slow.join();
    other.join();

    EXPECT_TRUE(other.isDone());
}

TEST(LockHooks, nobodyGetsInWhileLastRuns) {
    for (Entry const enter : {&Lock::readLock, &Lock::writeLock}) {
        Log log;
        std::latch isInLast(1);
        std::latch mayGoOn(1);
        std::atomic<int> calls = 0;
        Lock lock({{}, [&] {
                       if (calls++ == 0) {
                           isInLast.count_down();
                           mayGoOn.wait();
                           log.add("last done");
                       }
                   }});
        Worker slow([&] { auto const guard = lock.writeLock(); });
        isInLast.wait();
        Worker other([&] {
            auto const guard = (lock.*enter)();
            log.add("other in");
        });
        other.untilItWaits();

        mayGoOn.count_down();
        slow.join();
        other.join();

        EXPECT_EQ(log.entries(), (std::vector<std::string>{"last done", "other in"}));
        EXPECT_EQ(calls, 2);
    }
}

TEST(LockHooks, whatFirstThrowsReachesItsThreadWhichThenHoldsNothing) {
    for (Entry const enter : {&Lock::readLock, &Lock::writeLock}) {
        int firsts = 0;
        int lasts = 0;
        Lock lock({[&](Access) {
                       if (++firsts == 1) {
                           throw std::runtime_error("the disk says no");
                       }
                   },
                   [&] { ++lasts; }});

        EXPECT_THROW((lock.*enter)(), std::runtime_error);

        EXPECT_EQ(lasts, 0) << "there is nothing to undo for a first that failed";
        expectFree(lock);
        EXPECT_EQ(firsts, 2) << "the next one that comes is first again";
        EXPECT_EQ(lasts, 1);
        EXPECT_NO_THROW(lock.writeLock());
    }
}

TEST(LockHooks, aFailedFirstLetsTheOnesThatWaitIn) {
    for (Entry const failing : {&Lock::readLock, &Lock::writeLock}) {
        std::latch isInFirst(1);
        std::latch mayThrow(1);
        std::atomic<int> calls = 0;
        Lock lock({[&](Access) {
                       if (calls++ == 0) {
                           isInFirst.count_down();
                           mayThrow.wait();
                           throw std::runtime_error("the disk says no");
                       }
                   },
                   {}});
        Worker refused([&] { EXPECT_THROW((lock.*failing)(), std::runtime_error); });
        isInFirst.wait();
        Worker reader([&] { auto const guard = lock.readLock(); });
        Worker writer([&] { auto const guard = lock.writeLock(); });
        reader.untilItWaits();
        writer.untilItWaits();
        EXPECT_FALSE(reader.isDone());
        EXPECT_FALSE(writer.isDone());

        mayThrow.count_down();
        refused.join();
        reader.join();
        writer.join();

        EXPECT_EQ(calls, 3) << "each of the two that waited was first in its turn";
    }
}

TEST(LockHooks, betweenFirstAndLastOneWritesOrReadersShare) {
    constexpr int rounds = 500;
    std::atomic<int> open = 0;
    std::atomic<int> wrong = 0;
    Access access = Access::Read;
    Lock lock({[&](Access asked) {
                   wrong += open++ == 0 ? 0 : 1;
                   access = asked;
               },
               [&] { wrong += --open == 0 ? 0 : 1; }});
    auto const work = [&](Entry enter, Access expected) {
        for (int round = 0; round < rounds; ++round) {
            auto const guard = (lock.*enter)();
            wrong += open == 1 && access == expected ? 0 : 1;
        }
    };

    {
        std::vector<std::jthread> threads;
        for (int pair = 0; pair < 2; ++pair) {
            threads.emplace_back(work, &Lock::readLock, Access::Read);
            threads.emplace_back(work, &Lock::writeLock, Access::Write);
        }
    }

    EXPECT_EQ(wrong, 0);
    EXPECT_EQ(open, 0);
}

} // namespace cmlink
