#pragma once

#include <filesystem>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include <sys/resource.h>
#include <sys/types.h>

namespace project::test {

/// How a program ended, and what it wrote.
struct ProgramResult {
    int exitCode = -1; ///< -1 when a signal ended it
    int signal = 0;    ///< which one; 0 when none did
    std::string output;
    std::string errors;
};

/// What a program is started with.
struct ProgramSettings {
    std::filesystem::path folder = "/"; ///< the working folder
    /// Set over what the tests run with. Languages and git's own settings are taken out of that before.
    std::map<std::string, std::string> environment;
    rlim_t fileSize =
        RLIM_INFINITY; ///< how large a file may become: a full disk to whoever ignores the signal
    bool withoutPrivileges = false; ///< without root's capabilities: permissions apply to root, too
    bool onTerminal = false;        ///< standard output and error are one pseudo terminal
    bool inputOnTerminal = false;   ///< with onTerminal: standard input is the same one, which shows it, too
    bool inputStaysOpen = false;    ///< until the object goes; else standard input ends at once
};

/// A program that runs as a process of its own, and is ended with the object if it has not ended before.
class RunningProgram {
public:
    /// @param command the program's path and its arguments.
    /// @throws std::runtime_error when it cannot be started.
    RunningProgram(std::vector<std::string> const& command, ProgramSettings const& settings);
    ~RunningProgram();
    RunningProgram(RunningProgram const&) = delete;
    RunningProgram& operator=(RunningProgram const&) = delete;

    void sendSignal(int number) const;

    /// Waits for this many bytes of standard output, and then goes away without reading the rest.
    std::string readAndClose(std::size_t length);

    /// Waits for a line on standard output, or on standard error. @return it without its end; what there is
    /// of one when the program has ended, or after a long time.
    std::string readLine() const;
    std::string readErrorLine() const;

    /// Waits until the program sleeps, for input or for a lock. @return false when it has ended instead.
    bool waitUntilItSleeps() const;

    /// Feeds the program, and reads what it writes to the end. On a terminal all is `output`.
    ProgramResult finish(std::string_view input = {});

private:
    void exchange(std::string_view input, ProgramResult& result);

    pid_t child_ = -1;
    int input_ = -1;
    int output_ = -1;
    int errors_ = -1;
};

/// Starts a program and waits for its end.
ProgramResult runProgram(std::vector<std::string> const& command, ProgramSettings const& settings,
                         std::string_view input = {});

} // namespace project::test
