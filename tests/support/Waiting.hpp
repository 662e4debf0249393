#pragma once

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <functional>
#include <thread>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/types.h>
#include <time.h>
#include <unistd.h>

namespace project::test {

/// Waits until a condition holds, for up to a minute on a busy machine.
/// @return false if it does not hold in time.
inline bool comesTrue(std::function<bool()> const& condition,
                      std::chrono::milliseconds patience = std::chrono::minutes(1)) {
    auto const deadline = std::chrono::steady_clock::now() + patience;
    while (!condition()) {
        if (std::chrono::steady_clock::now() > deadline) {
            return false;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
    return true;
}

/// True if the system shows a thread of this process as asleep, as it does while the thread waits for a
/// lock.
inline bool isThreadAsleep(pid_t thread) {
    std::array<char, 64> name{};
    std::snprintf(name.data(), name.size(), "/proc/self/task/%d/stat", thread);
    std::array<char, 64> line{};
    int const file = ::open(name.data(), O_RDONLY | O_CLOEXEC);
    auto const length = file < 0 ? -1 : ::read(file, line.data(), line.size() - 1);
    ::close(file);
    return length > 0 && std::strstr(line.data(), ") S ") != nullptr;
}

/// True if the clock of file systems is at least this much later than the last change of a file.
inline bool isOlderThan(std::chrono::nanoseconds age, char const* file) {
    struct stat status {};

    timespec now{};
    auto const nanoseconds = [](timespec const& time) {
        return std::chrono::seconds(time.tv_sec) + std::chrono::nanoseconds(time.tv_nsec);
    };
    return ::stat(file, &status) == 0 && ::clock_gettime(CLOCK_REALTIME_COARSE, &now) == 0 &&
           nanoseconds(now) > std::max(nanoseconds(status.st_mtim), nanoseconds(status.st_ctim)) + age;
}

} // namespace project::test
