#include <algorithm>
#include <array>
#include <atomic>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstddef>
#include <fstream>
#include <functional>
#include <iostream>
#include <thread>

#include <fcntl.h>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <sys/prctl.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include "project/stores/SystemDisk.hpp"
#include "support/ChildProcess.hpp"
#include "support/NightlyScale.hpp"
#include "support/SharedMemory.hpp"
#include "support/TemporaryFolder.hpp"
#include "support/TextStore.hpp"
#include "support/Waiting.hpp"

namespace project::test {

namespace {

using namespace std::chrono_literals;
using stores::Disk;

constexpr std::size_t writerCount = 8;

/// From now on, every fcntl for open file description locks fails in this process, as on a file system
/// without them. @return false if the system cannot filter calls.
bool refuseLocksOfOpenFiles() {
    std::array<sock_filter, 6> program{{BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr)),
                                        BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, SYS_fcntl, 0, 3),
                                        BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, args[1])),
                                        BPF_JUMP(BPF_JMP | BPF_JGE | BPF_K, F_OFD_GETLK, 0,
                                                 1), // the three commands have consecutive numbers
                                        BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ERRNO | ENOLCK),
                                        BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW)}};
    // Commands with higher numbers fail, too; nothing here uses them.
    sock_fprog const filter{program.size(), program.data()};

    struct flock any {};

    return ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) == 0 &&
           ::prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &filter) == 0 &&
           ::fcntl(STDIN_FILENO, F_OFD_GETLK, &any) != 0 && errno == ENOLCK;
}

/// The lock of a store's folder, and the writers that wait for it.
class WriterQueue : public testing::Test {
protected:
    WriterQueue() { openDisk(); }

    std::unique_ptr<Disk> openDisk() const {
        auto disk = stores::makeSystemDisk(root.path(), TextBackend::folderName);
        disk->makeFolder();
        return disk;
    }

    /// The number of writers in the queue for this folder, according to the system.
    int placesTaken() const {
        struct stat folder {};

        ::stat((root.onDisk() / ".projectdata").c_str(), &folder);
        auto const inode = ":" + std::to_string(folder.st_ino) + " ";
        int count = 0;
        std::ifstream locks("/proc/locks");
        for (std::string line; std::getline(locks, line);) {
            count += line.find("OFDLCK") != line.npos && line.find(inode) != line.npos ? 1 : 0;
        }
        return count;
    }

    /// A process that waits for the lock, says "mine" or "not mine", and releases it on request.
    std::unique_ptr<ChildProcess> startWaiting(std::chrono::milliseconds patience = 60s) const {
        return std::make_unique<ChildProcess>([this, patience](ChildProcess::Parent const& parent) {
            auto const disk = openDisk();
            parent.say(disk->lock(patience) ? "mine" : "not mine");
            parent.await();
            disk->unlock();
            parent.await();
        });
    }

    TemporaryFolder root;
};

TEST_F(WriterQueue, writersGetTheLockInTheOrderOfTheirRequests) {
    struct Order {
        std::atomic<int> next;
        std::array<int, writerCount> turns;
    };

    SharedMemory<Order> order;
    auto const holder = openDisk();
    ASSERT_TRUE(holder->lock(0ms));
    std::vector<std::unique_ptr<ChildProcess>> writers;
    for (std::size_t number = 0; number < writerCount; ++number) {
        writers.push_back(std::make_unique<ChildProcess>([&, number](ChildProcess::Parent const&) {
            auto const disk = openDisk();
            if (disk->lock(60s)) {
                order->turns[number] = order->next++;
                disk->unlock();
            }
        }));
        ASSERT_TRUE(comesTrue([&] { return placesTaken() == static_cast<int>(number) + 1; }));
    }

    holder->unlock();

    for (std::size_t number = 0; number < writerCount; ++number) {
        EXPECT_TRUE(writers[number]->join());
        EXPECT_EQ(static_cast<int>(number), order->turns[number]);
    }
    EXPECT_EQ(0, placesTaken());
}

TEST_F(WriterQueue, noWriterOvertakesAWaitingOneMoreThanOnce) {
    struct Counts {
        std::atomic<bool> stop;
        std::array<std::atomic<int>, writerCount> writes;
        std::array<int, writerCount> writesBefore; ///< the waiting process got the lock
        std::atomic<int> begun;
    };

    SharedMemory<Counts> counts;
    auto const holder = openDisk();
    ASSERT_TRUE(holder->lock(0ms));
    ChildProcess waiting([&](ChildProcess::Parent const& parent) {
        auto const disk = openDisk();
        parent.say(disk->lock(60s) ? "mine" : "not mine");
        for (std::size_t number = 0; number < writerCount; ++number) {
            counts->writesBefore[number] = counts->writes[number];
        }
    });
    ASSERT_TRUE(comesTrue([&] { return placesTaken() == 1; }));
    std::vector<std::unique_ptr<ChildProcess>> others;
    for (std::size_t number = 1; number < writerCount; ++number) {
        others.push_back(std::make_unique<ChildProcess>([&, number](ChildProcess::Parent const&) {
            auto const disk = openDisk();
            auto const patience =
                number % 2 == 0 ? 60s : 0s; // the others stop waiting and try again all the time
            ++counts->begun;
            while (!counts->stop) {
                if (disk->lock(patience)) {
                    ++counts->writes[number];
                    disk->unlock();
                }
            }
        }));
    }
    ASSERT_TRUE(comesTrue([&] { return counts->begun == static_cast<int>(writerCount) - 1; }));

    holder->unlock();

    EXPECT_EQ("mine", waiting.hear());
    EXPECT_TRUE(waiting.join());
    EXPECT_TRUE(comesTrue([&] { return counts->writes[2] > 0; }));
    counts->stop = true;
    for (std::size_t number = 1; number < writerCount; ++number) {
        EXPECT_TRUE(others[number - 1]->join());
        EXPECT_LE(counts->writesBefore[number], 1) << number;
    }
}

TEST_F(WriterQueue, aWaitingWriterThatIsKilledBlocksNoOther) {
    auto const holder = openDisk();
    ASSERT_TRUE(holder->lock(0ms));
    auto const dead = startWaiting();
    ASSERT_TRUE(comesTrue([&] { return placesTaken() == 1; }));
    auto const next = startWaiting();
    ASSERT_TRUE(comesTrue([&] { return placesTaken() == 2; }));

    dead->kill();

    EXPECT_EQ(1, placesTaken());
    holder->unlock();
    EXPECT_EQ("mine", next->hear());
}

TEST_F(WriterQueue, aWriterThatGivesUpLeavesTheQueue) {
    auto const holder = openDisk();
    ASSERT_TRUE(holder->lock(0ms));

    auto const impatient = startWaiting(20ms);
    EXPECT_EQ("not mine", impatient->hear());

    EXPECT_EQ(0, placesTaken());
    holder->unlock();
    EXPECT_TRUE(openDisk()->lock(0ms));
}

TEST_F(WriterQueue, aWriterThatIsStoppedWhileItIsNextBlocksNoOther) {
    auto const holder = openDisk();
    ASSERT_TRUE(holder->lock(0ms));
    auto const stopped = startWaiting();
    ASSERT_TRUE(comesTrue([&] { return placesTaken() == 1; }));
    ::kill(stopped->id(), SIGSTOP);
    auto const next = startWaiting();
    ASSERT_TRUE(comesTrue([&] { return placesTaken() == 2; }));

    holder->unlock();

    EXPECT_EQ("mine", next->hear());
    next->goOn();
    ::kill(stopped->id(), SIGCONT);
    EXPECT_EQ("mine", stopped->hear()) << "it kept its place";
}

TEST_F(WriterQueue, aWriterThatDoesNotWaitDoesNotOvertakeThoseThatDo) {
    auto const holder = openDisk();
    ASSERT_TRUE(holder->lock(0ms));
    auto const waiting = startWaiting();
    ASSERT_TRUE(comesTrue([&] { return placesTaken() == 1; }));
    ::kill(waiting->id(), SIGSTOP);

    holder->unlock();

    EXPECT_FALSE(openDisk()->lock(0ms));
    ::kill(waiting->id(), SIGCONT);
    EXPECT_EQ("mine", waiting->hear());
    EXPECT_EQ(0, placesTaken()) << "the lock holder needs no place";
}

TEST_F(WriterQueue, aForkedChildDoesNotKeepThePlaceOfADeadParent) {
    std::array<int, 2> life{}; // the grandchild lives as long as this end is open here
    ASSERT_EQ(0, ::pipe(life.data()));
    auto const holder = openDisk();
    ASSERT_TRUE(holder->lock(0ms));
    ChildProcess waiting([&](ChildProcess::Parent const& parent) {
        std::thread thread([this] { openDisk()->lock(60s); });
        comesTrue([&] { return placesTaken() == 1; });
        if (::fork() == 0) {
            ::close(life[1]);
            parent.say("forked");
            char byte = 0;
            [[maybe_unused]] auto const end = ::read(life[0], &byte, 1);
            ::_exit(0);
        }
        thread.join();
    });
    ASSERT_EQ("forked", waiting.hear());
    ASSERT_EQ(1, placesTaken());

    waiting.kill();

    EXPECT_EQ(0, placesTaken());
    ::close(life[1]);
    ::close(life[0]);
}

TEST_F(WriterQueue, withoutAQueueInTheFileSystemWritersWaitToo) {
    auto const holder = openDisk();
    ASSERT_TRUE(holder->lock(0ms));
    ChildProcess waiting([this](ChildProcess::Parent const& parent) {
        if (!refuseLocksOfOpenFiles()) {
            parent.say("system calls cannot be filtered");
            return;
        }
        auto const disk = openDisk();
        parent.say(disk->lock(20ms) ? "mine" : "not mine");
        parent.say("waiting");
        parent.say(disk->lock(60s) ? "mine" : "not mine");
        disk->unlock();
        parent.say(disk->lock(0ms) ? "mine" : "not mine");
    });
    EXPECT_EQ("not mine", waiting.hear());
    EXPECT_EQ("waiting", waiting.hear());
    EXPECT_EQ(0, placesTaken());

    holder->unlock();

    EXPECT_EQ("mine", waiting.hear());
    EXPECT_EQ("mine", waiting.hear());
}

/// The waits of one writer.
struct Waits {
    static constexpr std::size_t most = 1U << 20U;

    std::atomic<std::size_t> count;
    std::array<unsigned, most>
        overtakers; ///< of each wait: writes of others between the request and the lock

    std::vector<unsigned> sorted() const {
        std::vector<unsigned> result(overtakers.begin(),
                                     overtakers.begin() + static_cast<std::ptrdiff_t>(count.load()));
        std::sort(result.begin(), result.end());
        return result;
    }
};

/// The quantile of sorted numbers.
unsigned quantile(std::vector<unsigned> const& sorted, double part) {
    return sorted[static_cast<std::size_t>(static_cast<double>(sorted.size() - 1) * part)];
}

/// The mean of waits, weighted by their length: the mean wait at a random moment. Many short waits of a few
/// writers do not hide long waits of the rest.
double weightedMean(std::vector<unsigned> const& waits) {
    double sum = 0;
    double ofSquares = 0;
    for (double const wait : waits) {
        sum += wait;
        ofSquares += wait * wait;
    }
    return ofSquares / sum;
}

struct Crowd {
    std::atomic<bool> stop;
    std::atomic<unsigned> writes;
    std::array<Waits, writerCount> waits;

    bool haveAllWritten() const {
        return std::ranges::all_of(waits, [](Waits const& own) { return own.count > 0; });
    }
};

void writeAsFastAsItGoes(Crowd& crowd, Waits& waits, Backend& backend, std::u16string const& name) {
    while (!crowd.stop && waits.count < Waits::most) {
        auto const before = crowd.writes.load();
        Entered const entered(backend, Access::Write);
        waits.overtakers[waits.count] = crowd.writes - before;
        std::u16string const value(1, static_cast<char16_t>(u'a' + waits.count % 26));
        backend.write({set(fileAddress(name), makeNode(u"Info", {{u"N", value}}))});
        backend.keep();
        ++crowd.writes;
        ++waits.count;
    }
}

TEST_F(WriterQueue, inACrowdAWaitIsAsLongAsTheQueue) {
    SharedMemory<Crowd> crowd;
    auto const open = [this] {
        // appends, like a large project
        return std::make_unique<TextBackend>(
            stores::makeSystemDisk(root.path(), TextBackend::folderName),
            TextBackend::Options{.patience = 60s, .alwaysRewritten = 0, .bodyToTail = 1});
    };
    root.remove(u".projectdata");
    commit(*open(), addFiles(manyFiles(1000)));
    std::vector<std::unique_ptr<ChildProcess>> writers;
    for (std::size_t number = 0; number < writerCount; ++number) {
        writers.push_back(std::make_unique<ChildProcess>([&, number](ChildProcess::Parent const& parent) {
            auto const backend = open();
            parent.await();
            writeAsFastAsItGoes(*crowd, crowd->waits[number], *backend, manyFiles(writerCount)[number]);
        }));
    }
    auto const seconds = testSeconds(1);
    for (auto const& writer : writers) {
        writer->goOn();
    }
    auto const end = std::chrono::steady_clock::now() + std::chrono::seconds(seconds);
    EXPECT_TRUE(comesTrue([&] { return std::chrono::steady_clock::now() > end && crowd->haveAllWritten(); },
                          std::chrono::seconds(seconds) + 60s));
    crowd->stop = true;

    std::vector<unsigned> all;
    for (std::size_t number = 0; number < writerCount; ++number) {
        EXPECT_TRUE(writers[number]->join());
        auto const waits = crowd->waits[number].sorted();
        ASSERT_FALSE(waits.empty());
        all.insert(all.end(), waits.begin(), waits.end());
    }
    std::sort(all.begin(), all.end());
    std::cout << "Writes of others during a wait, of " << all.size() << " writes in " << seconds << " s by "
              << writerCount << " processes: median " << quantile(all, 0.5) << ", 90 % " << quantile(all, 0.9)
              << ", 99 % " << quantile(all, 0.99) << ", 99.9 % " << quantile(all, 0.999) << ", all "
              << all.back() << "; weighted mean " << weightedMean(all) << "\n";
    // Each other writer is first once. More can overtake only between a request and its place in the queue.
    // This time is short, and few waits are affected, however busy the machine is.
    EXPECT_LE(weightedMean(all), 2 * (writerCount - 1));
}

} // namespace

} // namespace project::test
