#include <atomic>
#include <latch>
#include <optional>
#include <stdexcept>
#include <thread>

#include "cmlink/ReentrantReadWriteLock.hpp"
#include "platform/LockTestThreads.hpp"

namespace cmlink {

namespace {

using Lock = ReentrantReadWriteLock;
using Access = Lock::Access;
using Entry = Lock::LockGuard (Lock::*)();

Lock::Hooks hooksThatTell(Log& log) {
    return {[&log](Access access) { log.add(access == Access::Read ? "first reads" : "first writes"); },
            [&log] { log.add("last"); }};
}

} // namespace

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

TEST(LockHooks, theReaderThatLeavesLastRunsLastAlthoughItWasNotFirst) {
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

TEST(LockHooks, eachHandoverBetweenThreadsThatExcludeEachOtherIsALastAndAFirst) {
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

TEST(LockHooks, readersThatWaitedForFirstEnterBesideTheOneThatRanIt) {
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

TEST(LockHooks, noThreadEntersWhileLastRuns) {
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

TEST(LockHooks, anExceptionOfFirstPropagatesToItsThreadWhichThenHoldsNoLock) {
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

TEST(LockHooks, aFailedFirstAdmitsTheWaitingThreads) {
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

TEST(LockHooks, betweenFirstAndLastOneThreadWritesOrReadersShare) {
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
