#include "support/TracedProcess.hpp"

#include <array>
#include <csignal>
#include <cstdlib>
#include <stdexcept>
#include <utility>

#include <fcntl.h>
#include <sys/ptrace.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

namespace project::test {

namespace {

constexpr std::array<std::pair<long, char const*>, 16> calls{{
    {SYS_write, "write"},
    {SYS_pwrite64, "pwrite"},
    {SYS_rename, "rename"},
    {SYS_renameat, "renameat"},
    {SYS_renameat2, "renameat2"},
    {SYS_mkdir, "mkdir"},
    {SYS_mkdirat, "mkdirat"},
    {SYS_rmdir, "rmdir"},
    {SYS_unlink, "unlink"},
    {SYS_unlinkat, "unlinkat"},
    {SYS_fsync, "fsync"},
    {SYS_fdatasync, "fdatasync"},
    {SYS_ftruncate, "ftruncate"},
    {SYS_fallocate, "fallocate"},
    {SYS_linkat, "linkat"},
    {SYS_utimensat, "utimensat"},
}};

constexpr int atCall = SIGTRAP | 0x80; // of PTRACE_O_TRACESYSGOOD

/// The name of the call that a stopped process is about to make, if it changes files.
char const* changingCall(pid_t process) {
    __ptrace_syscall_info info{};
    ::ptrace(PTRACE_GET_SYSCALL_INFO, process, sizeof info, &info);
    if (info.op != PTRACE_SYSCALL_INFO_ENTRY) {
        return nullptr;
    }
    if (info.entry.nr == SYS_openat && (info.entry.args[2] & O_CREAT) != 0) {
        return "openat";
    }
    for (auto const& [number, name] : calls) {
        if (std::cmp_equal(info.entry.nr, number)) {
            return name;
        }
    }
    return nullptr;
}

[[noreturn]] void runTraced(std::function<void()> const& run) {
    ::ptrace(PTRACE_TRACEME, 0, nullptr, nullptr);
    ::raise(SIGSTOP);
    try {
        run();
    } catch (...) {
        ::_exit(EXIT_FAILURE);
    }
    ::_exit(EXIT_SUCCESS);
}

} // namespace

std::optional<std::string> killAtCall(std::size_t call, std::function<void()> const& run) {
    auto const process = ::fork();
    if (process == 0) {
        runTraced(run);
    }
    int state = 0;
    ::waitpid(process, &state, 0);
    ::ptrace(PTRACE_SETOPTIONS, process, nullptr, PTRACE_O_EXITKILL | PTRACE_O_TRACESYSGOOD);
    while (WIFSTOPPED(state)) {
        auto const* const name = WSTOPSIG(state) == atCall ? changingCall(process) : nullptr;
        if (name != nullptr && --call == 0) {
            ::kill(process, SIGKILL);
            ::waitpid(process, &state, 0);
            return name;
        }
        ::ptrace(PTRACE_SYSCALL, process, nullptr, nullptr);
        ::waitpid(process, &state, 0);
    }
    if (!WIFEXITED(state) || WEXITSTATUS(state) != EXIT_SUCCESS) {
        throw std::runtime_error("the traced process has failed");
    }
    return std::nullopt;
}

} // namespace project::test
