#include "git/PipedProcess.hpp"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstddef>
#include <system_error>

#include <fcntl.h>
#include <poll.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include "texts/Message.hpp"

namespace projectctl {

namespace {

[[noreturn]] void fail(int error, Message const& what) {
    throw std::system_error(error, std::generic_category(), what.text());
}

/// One end of a pipe, closed by the destructor.
class Descriptor {
public:
    explicit Descriptor(int value = -1) : value_(value) {}

    Descriptor(Descriptor&& other) noexcept : value_(other.value_) { other.value_ = -1; }

    Descriptor(Descriptor const&) = delete;
    Descriptor& operator=(Descriptor const&) = delete;
    Descriptor& operator=(Descriptor&&) = delete;

    ~Descriptor() { close(); }

    int get() const noexcept { return value_; }

    void close() noexcept {
        if (value_ >= 0) {
            ::close(value_);
            value_ = -1;
        }
    }

private:
    int value_;
};

struct Pipe {
    Descriptor readEnd;
    Descriptor writeEnd;
};

Pipe makePipe() {
    std::array<int, 2> ends{};
    if (pipe2(ends.data(), O_CLOEXEC) != 0) {
        fail(errno, Message("PipeNotCreated"));
    }
    return {Descriptor(ends[0]), Descriptor(ends[1])};
}

/// The state in which the child starts: its three streams, and the default handling of signals.
class SpawnSettings {
public:
    SpawnSettings(int input, int output, int errors) {
        posix_spawn_file_actions_init(&actions_);
        posix_spawn_file_actions_adddup2(&actions_, input, STDIN_FILENO);
        posix_spawn_file_actions_adddup2(&actions_, output, STDOUT_FILENO);
        posix_spawn_file_actions_adddup2(&actions_, errors, STDERR_FILENO);
        posix_spawnattr_init(&attributes_);
        sigset_t signals;
        sigemptyset(&signals);
        posix_spawnattr_setsigmask(&attributes_, &signals);
        sigaddset(&signals, SIGPIPE);
        sigaddset(&signals, SIGXFSZ);
        posix_spawnattr_setsigdefault(&attributes_, &signals);
        posix_spawnattr_setflags(&attributes_, POSIX_SPAWN_SETSIGDEF | POSIX_SPAWN_SETSIGMASK);
    }

    ~SpawnSettings() {
        posix_spawn_file_actions_destroy(&actions_);
        posix_spawnattr_destroy(&attributes_);
    }

    SpawnSettings(SpawnSettings const&) = delete;
    SpawnSettings& operator=(SpawnSettings const&) = delete;

    pid_t spawn(std::vector<std::string> const& command) const {
        std::vector<char*> arguments;
        arguments.reserve(command.size() + 1);
        for (auto const& argument : command) {
            arguments.push_back(const_cast<char*>(argument.c_str()));
        }
        arguments.push_back(nullptr);
        pid_t child = 0;
        int const error =
            posix_spawnp(&child, arguments.front(), &actions_, &attributes_, arguments.data(), environ);
        if (error != 0) {
            fail(error, Message("ProgramNotStarted", command.front()));
        }
        return child;
    }

private:
    posix_spawn_file_actions_t actions_{};
    posix_spawnattr_t attributes_{};
};

/// Writes as much as the pipe accepts now. Closes it when all is written, or when its reader has closed it.
void feed(Descriptor& pipe, std::string_view& input) {
    auto const written = input.empty() ? 0 : write(pipe.get(), input.data(), input.size());
    if (written > 0) {
        input.remove_prefix(static_cast<std::size_t>(written));
    }
    bool const failed = written < 0 && errno != EAGAIN && errno != EINTR;
    if (failed || input.empty()) {
        pipe.close();
    }
}

/// Reads the bytes that are in the pipe now. Closes it at its end.
void drain(Descriptor& pipe, std::string& to) {
    std::array<char, 65536> piece; // NOLINT(cppcoreguidelines-pro-type-member-init): read fills it
    auto const got = read(pipe.get(), piece.data(), piece.size());
    if (got > 0) {
        to.append(piece.data(), static_cast<std::size_t>(got));
    } else if (got == 0 || errno != EINTR) {
        pipe.close();
    }
}

void exchange(Descriptor& toChild, std::string_view input, Descriptor& output, Descriptor& errors,
              ProcessResult& result) {
    while (output.get() >= 0 || errors.get() >= 0) {
        // The descriptor of a closed pipe is negative, and poll ignores it.
        std::array<pollfd, 3> waiting{{{toChild.get(), POLLOUT, 0}, //
                                       {output.get(), POLLIN, 0},
                                       {errors.get(), POLLIN, 0}}};
        if (poll(waiting.data(), waiting.size(), -1) < 0 && errno != EINTR) {
            fail(errno, Message("OutputNotAwaited"));
        }
        if (waiting[0].revents != 0) {
            feed(toChild, input);
        }
        if (waiting[1].revents != 0) {
            drain(output, result.output);
        }
        if (waiting[2].revents != 0) {
            drain(errors, result.errors);
        }
    }
}

int waitFor(pid_t child) {
    int status = 0;
    while (waitpid(child, &status, 0) < 0) {
        if (errno != EINTR) {
            fail(errno, Message("EndNotAwaited"));
        }
    }
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

} // namespace

int runVisibly(std::vector<std::string> const& command, std::string_view input) {
    auto toChild = makePipe();
    auto const child = SpawnSettings(toChild.readEnd.get(), STDOUT_FILENO, STDERR_FILENO).spawn(command);
    toChild.readEnd.close();
    while (toChild.writeEnd.get() >= 0) {
        feed(toChild.writeEnd, input);
    }
    return waitFor(child);
}

ProcessResult runWithInput(std::vector<std::string> const& command, std::string_view input) {
    auto toChild = makePipe();
    auto output = makePipe();
    auto errors = makePipe();
    if (fcntl(toChild.writeEnd.get(), F_SETFL, O_NONBLOCK) != 0) {
        fail(errno, Message("PipeNotSetUp"));
    }
    auto const child =
        SpawnSettings(toChild.readEnd.get(), output.writeEnd.get(), errors.writeEnd.get()).spawn(command);
    toChild.readEnd.close();
    output.writeEnd.close();
    errors.writeEnd.close();
    ProcessResult result{};
    exchange(toChild.writeEnd, input, output.readEnd, errors.readEnd, result);
    toChild.writeEnd.close();
    result.exitCode = waitFor(child);
    return result;
}

} // namespace projectctl
