// Linked into every program of a coverage build, and into no other. The counters of a process are written
// when it exits; here also when it calls _exit, raises a signal or is killed by one of our programs.
#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>

#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

extern "C" {

void __gcov_dump();
void __gcov_reset();
void __real__exit(int status) __attribute__((noreturn));
void __wrap__exit(int status) __attribute__((noreturn));
int __real_raise(int number);
int __wrap_raise(int number);
int __real_kill(pid_t process, int number);
int __wrap_kill(pid_t process, int number);

} // extern "C"

namespace {

constexpr auto requestToEnd = SIGUSR1;
volatile std::sig_atomic_t isEnding = 0;

/// Lets the counters be written without interruption, and regardless of a limit on the size of files.
void prepareEnd() {
    isEnding = 1;
    rlimit limit{};
    getrlimit(RLIMIT_FSIZE, &limit);
    limit.rlim_cur = limit.rlim_max;
    setrlimit(RLIMIT_FSIZE, &limit);
}

void writeCounters() {
    prepareEnd();
    __gcov_dump();
    __gcov_reset(); // they may be written again at the end
}

void endBy(int number) {
    if (isEnding != 0) {
        return; // it is writing its counters
    }
    writeCounters();
    std::signal(number, SIG_DFL);
    __real_kill(getpid(), number == requestToEnd ? SIGKILL : number);
}

/// Gives a process that is about to be killed the time to write its counters.
void requestEnd(pid_t process) {
    constexpr int tries = 2000;
    __real_kill(process, requestToEnd);
    for (int count = 0; count < tries; ++count) {
        siginfo_t ended{};
        if (waitid(P_PID, static_cast<id_t>(process), &ended, WEXITED | WNOHANG | WNOWAIT) != 0 ||
            ended.si_pid == process) {
            return;
        }
        usleep(1000);
    }
}

[[gnu::constructor]] void handleSignals() {
    std::atexit(prepareEnd);
    for (auto const number : std::array{SIGINT, SIGTERM, requestToEnd}) {
        struct sigaction current {};

        sigaction(number, nullptr, &current);
        if (current.sa_handler == SIG_DFL) {
            std::signal(number, endBy);
        }
    }
}

} // namespace

void __wrap__exit(int status) {
    writeCounters();
    __real__exit(status);
}

int __wrap_raise(int number) {
    writeCounters();
    isEnding = 0; // the signal may be handled or ignored
    return __real_raise(number);
}

int __wrap_kill(pid_t process, int number) {
    if (number == SIGKILL) {
        auto const error = errno;
        requestEnd(process);
        errno = error;
    }
    return __real_kill(process, number);
}
