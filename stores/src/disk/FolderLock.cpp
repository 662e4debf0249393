#include "disk/FolderLock.hpp"

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <fstream>
#include <optional>
#include <sstream>
#include <thread>

#include <sys/file.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>

#include "disk/SystemError.hpp"
#include "disk/WriterQueue.hpp"

namespace project::stores {

namespace {

using std::chrono::steady_clock;

/// Most batches take a fraction of a millisecond, so whoever is next looks often; others need not.
constexpr auto firstNap = std::chrono::microseconds(50);
constexpr auto longestNapOfNext = std::chrono::microseconds(1'000);
constexpr auto longestNap = std::chrono::microseconds(20'000);

/// The next in line takes a free lock within a millisecond, unless the machine is very busy.
constexpr auto longestDelayOfNext = std::chrono::milliseconds(200);

bool tryLock(int folder, std::string const& name) {
    int result = 0;
    do {
        result = ::flock(folder, LOCK_EX | LOCK_NB);
    } while (result != 0 && errno == EINTR);
    if (result != 0 && errno != EWOULDBLOCK) {
        throwSystemError(name, "can't be locked", errno);
    }
    return result == 0;
}

/// A writer that stands in the queue, and looks now and then whether it is its turn.
class WaitingWriter {
public:
    WaitingWriter(int folder, std::string const& name) : folder_(folder), name_(name), place_(folder) {
        place_.take();
    }

    /// @return true when it has the lock.
    bool look();

    /// How long to wait until the next look: longer each time as long as nobody in front moves on.
    steady_clock::duration nap();

private:
    /// Takes the lock if the first in line lets it lie.
    bool passFirst();

    steady_clock::duration longestNapHere() const;

    /// How far from the front this one is, as far as it matters for naps.
    off_t steps() const { return first_ ? std::min<off_t>(place_.stepsBehind(*first_), 20) : 0; }

    int folder_;
    std::string const& name_;
    QueuePlace place_;
    std::optional<off_t> first_; ///< of those in front
    steady_clock::duration nap_ = firstNap;
    std::optional<steady_clock::time_point> freeSince_;
};

bool WaitingWriter::look() {
    auto const first = place_.firstInFront();
    if (first != first_) {
        first_ = first;
        nap_ = firstNap * (first ? 1 + place_.stepsBehind(*first) : 1);
        freeSince_.reset();
    }
    return first ? passFirst() : tryLock(folder_, name_);
}

/// A process that was stopped while it was first, by a debugger or from a terminal, would stop all others.
/// So one that finds the lock free for as long as this, whenever it looks, does not wait for the first.
bool WaitingWriter::passFirst() {
    if (nap_ < longestNapHere()) {
        return false; // it has only just come to be the first
    }
    if (!tryLock(folder_, name_)) {
        freeSince_.reset();
        return false;
    }
    auto const now = steady_clock::now();
    freeSince_ = freeSince_.value_or(now);
    if (now - *freeSince_ >= longestDelayOfNext) {
        return true;
    }
    unlockFolder(folder_);
    return false;
}

steady_clock::duration WaitingWriter::nap() {
    auto const now = std::min(nap_, longestNapHere());
    nap_ = std::min(nap_ * 2, longestNapHere());
    return now;
}

steady_clock::duration WaitingWriter::longestNapHere() const {
    if (!place_.isTaken()) {
        return longestNap;
    }
    return std::min<steady_clock::duration>(longestNapOfNext * (1 + steps()), longestNap);
}

std::string commandOf(std::string const& process) {
    std::ifstream file("/proc/" + process + "/comm");
    std::string command;
    std::getline(file, command);
    return command;
}

/// True when a line of /proc/locks tells of a lock on this file: its seventh word, "major:minor:inode".
bool isLockOn(std::string const& place, struct stat const& file) {
    unsigned int majorNumber = 0;
    unsigned int minorNumber = 0;
    unsigned long long inode = 0;
    return std::sscanf(place.c_str(), "%x:%x:%llu", &majorNumber, &minorNumber, &inode) == 3 &&
           majorNumber == major(file.st_dev) && minorNumber == minor(file.st_dev) && inode == file.st_ino;
}

} // namespace

bool lockFolder(int folder, std::string const& name, std::chrono::milliseconds patience) {
    if (!QueuePlace::isAnybodyIn(folder) && tryLock(folder, name)) {
        return true;
    }
    if (patience <= std::chrono::milliseconds(0)) {
        return false;
    }
    auto const deadline = steady_clock::now() + patience;
    WaitingWriter waiting(folder, name);
    while (!waiting.look()) {
        auto const now = steady_clock::now();
        if (now >= deadline) {
            return false;
        }
        std::this_thread::sleep_for(std::min(waiting.nap(), deadline - now));
    }
    return true;
}

void unlockFolder(int folder) noexcept {
    ::flock(folder, LOCK_UN);
}

std::string findLockHolder(int folder) {
    struct stat status {};

    if (::fstat(folder, &status) != 0) {
        return {};
    }
    std::ifstream locks("/proc/locks");
    for (std::string line; std::getline(locks, line);) {
        std::istringstream words(line);
        std::string number, kind, advisory, access, process, place;
        words >> number >> kind >> advisory >> access >> process >> place;
        if (kind == "FLOCK" && isLockOn(place, status)) {
            auto const command = commandOf(process);
            return "process " + process + (command.empty() ? "" : " (" + command + ")");
        }
    }
    return {};
}

} // namespace project::stores
