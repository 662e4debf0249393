#include "support/RunningProgram.hpp"

#include <array>
#include <cerrno>
#include <csignal>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <system_error>

#include <fcntl.h>
#include <linux/capability.h>
#include <poll.h>
#include <pty.h>
#include <sys/prctl.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

namespace project::test {

namespace {

void require(bool condition, char const* what) {
    if (!condition) {
        throw std::system_error(errno, std::generic_category(), what);
    }
}

void closeIfOpen(int& descriptor) {
    if (descriptor >= 0) {
        close(descriptor);
        descriptor = -1;
    }
}

struct Pipe {
    int readEnd;
    int writeEnd;
};

Pipe makePipe() {
    std::array<int, 2> ends{};
    require(pipe2(ends.data(), O_CLOEXEC) == 0, "pipe2");
    return {ends[0], ends[1]};
}

/// Two pipes for the program's output, or both ends of a pseudo terminal.
struct Streams {
    Pipe output;
    Pipe errors;
};

Streams makeStreams(bool onTerminal) {
    if (!onTerminal) {
        return {makePipe(), makePipe()};
    }
    Pipe terminal{};
    require(openpty(&terminal.readEnd, &terminal.writeEnd, nullptr, nullptr, nullptr) == 0, "openpty");
    fcntl(terminal.readEnd, F_SETFD, FD_CLOEXEC);
    fcntl(terminal.writeEnd, F_SETFD, FD_CLOEXEC);
    return {terminal, {-1, terminal.writeEnd}};
}

bool isOurs(std::string const& variable) {
    return variable.starts_with("LC_") || variable.starts_with("LANG") || variable.starts_with("GIT_");
}

std::vector<std::string> environmentOf(ProgramSettings const& settings) {
    auto values = settings.environment;
    for (char** entry = environ; *entry != nullptr; ++entry) {
        std::string const text = *entry;
        auto const equals = text.find('=');
        auto const name = text.substr(0, equals);
        if (!isOurs(name)) {
            values.try_emplace(name, text.substr(equals + 1));
        }
    }
    std::vector<std::string> result;
    for (auto const& [name, value] : values) {
        result.push_back(name + '=' + value);
    }
    return result;
}

std::vector<char*> pointersTo(std::vector<std::string>& texts) {
    std::vector<char*> result;
    for (auto& text : texts) {
        result.push_back(text.data());
    }
    result.push_back(nullptr);
    return result;
}

/// Drops every capability for good, so that a program started as root has only the permissions of a file's
/// owner. The user stays the same: the program and its libraries can lie in a folder that only root can
/// enter.
bool dropCapabilities() {
    for (int capability = 0; prctl(PR_CAPBSET_READ, capability, 0, 0, 0) >= 0; ++capability) {
        if (prctl(PR_CAPBSET_DROP, capability, 0, 0, 0) != 0) {
            return false;
        }
    }
    __user_cap_header_struct header{_LINUX_CAPABILITY_VERSION_3, 0};
    std::array<__user_cap_data_struct, _LINUX_CAPABILITY_U32S_3> const none{};
    return syscall(SYS_capset, &header, none.data()) == 0;
}

/// In the child: becomes the program, or ends with 126.
[[noreturn]] void become(char** arguments, char** environment, ProgramSettings const& settings, int input,
                         Streams const& streams) {
    rlimit limit{settings.fileSize, RLIM_INFINITY};
    bool ready = dup2(input, STDIN_FILENO) >= 0 && dup2(streams.output.writeEnd, STDOUT_FILENO) >= 0 &&
                 dup2(streams.errors.writeEnd, STDERR_FILENO) >= 0 && setrlimit(RLIMIT_FSIZE, &limit) == 0 &&
                 chdir(settings.folder.c_str()) == 0;
    if (settings.withoutPrivileges && geteuid() == 0) {
        ready = ready && dropCapabilities();
    }
    for (int const number :
         {SIGHUP, SIGINT, SIGQUIT, SIGTERM}) { // a shell ignores some of these in the background
        std::signal(number, SIG_DFL);
    }
    if (ready) {
        execvpe(arguments[0], arguments, environment);
    }
    _exit(126);
}

/// @return false at the end of the output.
bool readSome(int descriptor, std::string& to) {
    std::array<char, 65536> piece; // NOLINT: read fills it
    auto const got = read(descriptor, piece.data(), piece.size());
    if (got > 0) {
        to.append(piece.data(), static_cast<std::size_t>(got));
    }
    return got > 0 || (got < 0 && errno == EINTR);
}

/// Byte by byte, so that nothing of the next line is taken.
std::string lineFrom(int descriptor) {
    constexpr int patience = 20'000; // milliseconds
    std::string line;
    pollfd waiting{descriptor, POLLIN, 0};
    char byte = 0;
    while (poll(&waiting, 1, patience) > 0 && read(descriptor, &byte, 1) == 1 && byte != '\n') {
        line += byte;
    }
    return line;
}

} // namespace

RunningProgram::RunningProgram(std::vector<std::string> const& command, ProgramSettings const& settings) {
    auto commandTexts = command;
    auto environmentTexts = environmentOf(settings);
    auto const arguments = pointersTo(commandTexts);
    auto const environment = pointersTo(environmentTexts);
    auto input = makePipe();
    auto streams = makeStreams(settings.onTerminal);
    if (settings.inputOnTerminal) { // writing to the terminal's other side is typing
        close(input.readEnd);
        close(input.writeEnd);
        input = {fcntl(streams.output.writeEnd, F_DUPFD_CLOEXEC, 0),
                 fcntl(streams.output.readEnd, F_DUPFD_CLOEXEC, 0)};
    }
    child_ = fork();
    require(child_ >= 0, "fork");
    if (child_ == 0) {
        become(const_cast<char**>(arguments.data()), const_cast<char**>(environment.data()), settings,
               input.readEnd, streams);
    }
    close(input.readEnd);
    close(streams.output.writeEnd);
    if (!settings.onTerminal) {
        close(streams.errors.writeEnd);
    }
    input_ = input.writeEnd;
    output_ = streams.output.readEnd;
    errors_ = streams.errors.readEnd;
}

RunningProgram::~RunningProgram() {
    closeIfOpen(input_);
    closeIfOpen(output_);
    closeIfOpen(errors_);
    if (child_ > 0) {
        kill(child_, SIGKILL);
        waitpid(child_, nullptr, 0);
    }
}

void RunningProgram::sendSignal(int number) const {
    kill(child_, number);
}

std::string RunningProgram::readAndClose(std::size_t length) {
    std::string result;
    while (result.size() < length && readSome(output_, result)) {
    }
    closeIfOpen(output_);
    return result;
}

std::string RunningProgram::readLine() const {
    return lineFrom(output_);
}

std::string RunningProgram::readErrorLine() const {
    return lineFrom(errors_);
}

bool RunningProgram::waitUntilItSleeps() const {
    for (int sleeps = 0; sleeps < 5;) { // a running program sleeps now and then, but not this often
        std::ifstream file("/proc/" + std::to_string(child_) + "/stat");
        std::string const text{std::istreambuf_iterator<char>(file), {}};
        auto const behindName = text.rfind(')');
        if (behindName == std::string::npos || text.size() < behindName + 3 || text[behindName + 2] == 'Z') {
            return false;
        }
        sleeps = text[behindName + 2] == 'S' ? sleeps + 1 : 0;
        usleep(20'000);
    }
    return true;
}

void RunningProgram::exchange(std::string_view input, ProgramResult& result) {
    while (output_ >= 0 || errors_ >= 0) {
        if (input.empty()) {
            closeIfOpen(input_);
        }
        std::array<pollfd, 3> waiting{{{input_, POLLOUT, 0}, {output_, POLLIN, 0}, {errors_, POLLIN, 0}}};
        poll(waiting.data(), waiting.size(), -1);
        if (waiting[0].revents != 0) {
            auto const written = write(input_, input.data(), std::min<std::size_t>(input.size(), 4096));
            input.remove_prefix(written > 0 ? static_cast<std::size_t>(written) : input.size());
        }
        if (waiting[1].revents != 0 && !readSome(output_, result.output)) {
            closeIfOpen(output_);
        }
        if (waiting[2].revents != 0 && !readSome(errors_, result.errors)) {
            closeIfOpen(errors_);
        }
    }
    closeIfOpen(input_);
}

ProgramResult RunningProgram::finish(std::string_view input) {
    ProgramResult result;
    exchange(input, result);
    int status = 0;
    require(waitpid(child_, &status, 0) == child_, "waitpid");
    child_ = -1;
    result.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    result.signal = WIFSIGNALED(status) ? WTERMSIG(status) : 0;
    return result;
}

ProgramResult runProgram(std::vector<std::string> const& command, ProgramSettings const& settings,
                         std::string_view input) {
    return RunningProgram(command, settings).finish(input);
}

} // namespace project::test
