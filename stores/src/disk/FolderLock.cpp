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

#include "disk/QueuePlace.hpp"
#include "disk/SystemError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

using std::chrono::steady_clock;

/// Most batches take a fraction of a millisecond, so the first in the queue checks often; the others need
/// not.
constexpr auto firstNap = std::chrono::microseconds(50);
constexpr auto longestNapOfFirst = std::chrono::microseconds(1'000);
constexpr auto longestNap = std::chrono::microseconds(20'000);

/// The first in the queue takes a free lock within a millisecond, unless the machine is very busy.
constexpr auto longestDelayOfFirst = std::chrono::milliseconds(200);

bool tryLock(int folder, std::string const& name) {
    int const result = repeatWhenInterrupted([folder] { return ::flock(folder, LOCK_EX | LOCK_NB); });
    if (result != 0 && errno != EWOULDBLOCK) {
        throwSystemError(name, "CannotLock", errno);
    }
    return result == 0;
}

/// A writer in the queue, which checks repeatedly whether it is first.
class WaitingWriter {
public:
    WaitingWriter(int folder, std::string const& name) : folder_(folder), name_(name), place_(folder) {
        place_.take();
    }

    /// @return true if it has the lock now.
    bool tryToLock();

    /// The time until the next attempt: longer each time, until the first in the queue changes.
    steady_clock::duration nap();

private:
    /// Takes the lock if the first in the queue leaves it unused.
    bool overtakeFirst();

    steady_clock::duration longestNapHere() const;

    /// The distance to the first in the queue, as far as it matters for the waiting time.
    off_t steps() const { return first_ ? std::min<off_t>(place_.stepsBehind(*first_), 20) : 0; }

    int folder_;
    std::string const& name_;
    QueuePlace place_;
    std::optional<off_t> first_; ///< the place of the first in the queue; empty if it is this one
    steady_clock::duration nap_ = firstNap;
    std::optional<steady_clock::time_point> freeSince_;
};

bool WaitingWriter::tryToLock() {
    auto const first = place_.firstInFront();
    if (first != first_) {
        first_ = first;
        nap_ = firstNap * (first ? 1 + place_.stepsBehind(*first) : 1);
        freeSince_.reset();
    }
    return first ? overtakeFirst() : tryLock(folder_, name_);
}

/// A process that is stopped while it is first, by a debugger or from a terminal, would stop all others. So a
/// writer that has found the lock free at each attempt for longestDelayOfFirst overtakes it.
bool WaitingWriter::overtakeFirst() {
    if (nap_ < longestNapHere()) {
        return false; // it has only just become the first
    }
    if (!tryLock(folder_, name_)) {
        freeSince_.reset();
        return false;
    }
    auto const now = steady_clock::now();
    freeSince_ = freeSince_.value_or(now);
    if (now - *freeSince_ >= longestDelayOfFirst) {
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
    return std::min<steady_clock::duration>(longestNapOfFirst * (1 + steps()), longestNap);
}

std::string commandOf(std::string const& process) {
    std::ifstream file("/proc/" + process + "/comm");
    std::string command;
    std::getline(file, command);
    return command;
}

/// True if a lock in /proc/locks is on this file. @param place the sixth word of its line,
/// "major:minor:inode".
bool isLockOn(std::string const& place, struct stat const& file) {
    unsigned int majorNumber = 0;
    unsigned int minorNumber = 0;
    unsigned long long inode = 0;
    return std::sscanf(place.c_str(), "%x:%x:%llu", &majorNumber, &minorNumber, &inode) == 3 &&
           majorNumber == major(file.st_dev) && minorNumber == minor(file.st_dev) && inode == file.st_ino;
}

} // namespace

bool lockFolder(int folder, std::string const& name, std::chrono::milliseconds patience) {
    if (!QueuePlace::isOccupied(folder) && tryLock(folder, name)) {
        return true;
    }
    if (patience <= std::chrono::milliseconds(0)) {
        return false;
    }
    auto const deadline = steady_clock::now() + patience;
    WaitingWriter waiting(folder, name);
    while (!waiting.tryToLock()) {
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
            std::string const command = commandOf(process);
            return command.empty() ? errorTexts.get("LockHolder", process)
                                   : errorTexts.get("LockHolderNamed", process, command);
        }
    }
    return {};
}

} // namespace project::stores
