#include "cmlink/ReentrantReadWriteLock.hpp"

#include <array>
#include <atomic>
#include <functional>
#include <latch>
#include <optional>
#include <system_error>
#include <thread>
#include <utility>

#include "platform/LockTestThreads.hpp"

namespace cmlink {

namespace {

using Lock = ReentrantReadWriteLock;
using Guard = Lock::LockGuard;
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

TEST(ReentrantReadWriteLock, aReaderAdmitsReadersAndNoWriters) {
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

TEST(ReentrantReadWriteLock, aWriterExcludesReadersAndWriters) {
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

TEST(ReentrantReadWriteLock, isReleasedOnlyWithTheOutermostGuard) {
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

TEST(ReentrantReadWriteLock, aWriterExcludesOthersUntilItReleasesItsLastGuardInAnyOrder) {
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

TEST(ReentrantReadWriteLock, aReaderThatRequestsTheWriteLockIsRefusedAtOnceAndContinuesToRead) {
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

TEST(ReentrantReadWriteLock, aThreadThatReadsMayReadAgainWhileAWriterWaits) {
    Lock lock;
    auto outer = std::make_optional(lock.readLock());
    Worker writer([&] { auto const guard = lock.writeLock(); });
    writer.untilItWaits();

    auto inner = std::make_optional(lock.readLock());

    EXPECT_FALSE(writer.isDone());
    inner.reset();
    outer.reset();
}

TEST(ReentrantReadWriteLock, aWaitingWriterPrecedesALaterReader) {
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

TEST(ReentrantReadWriteLock, waitingReadersAreNextWhenAWriterReleasesTheLock) {
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

TEST(ReentrantReadWriteLock, aReturningWriterFollowsTheReadersThatWaitedForIt) {
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

TEST(ReentrantReadWriteLock, manyThreadsNeverSeeAPartialChange) {
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

TEST(ReentrantReadWriteLock, aLockAtTheAddressOfADestroyedOneIsFree) {
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

TEST(LockGuard, movingItTransfersTheLock) {
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

TEST(LockGuard, assigningReleasesTheLockThatWasHeld) {
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

TEST(LockGuard, aMovedFromGuardCanBeAssigned) {
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

} // namespace cmlink
