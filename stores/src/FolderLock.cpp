#include "FolderLock.hpp"

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <fstream>
#include <sstream>
#include <thread>

#include <sys/file.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>

#include "SystemError.hpp"

namespace project::stores {

namespace {

using std::chrono::steady_clock;

/// The first naps are short, since most batches take a fraction of a millisecond.
constexpr auto firstNap = std::chrono::microseconds(50);
constexpr auto longestNap = std::chrono::microseconds(20'000);

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
    auto const deadline = steady_clock::now() + patience;
    auto nap = firstNap;
    while (::flock(folder, LOCK_EX | LOCK_NB) != 0) {
        if (errno == EINTR) {
            continue;
        }
        if (errno != EWOULDBLOCK) {
            throwSystemError(name, "can't be locked", errno);
        }
        auto const now = steady_clock::now();
        if (now >= deadline) {
            return false;
        }
        std::this_thread::sleep_for(std::min<steady_clock::duration>(nap, deadline - now));
        nap = std::min(nap * 2, longestNap);
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
