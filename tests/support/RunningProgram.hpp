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
    int exitCode = -1; ///< -1 if a signal ended it
    int signal = 0;    ///< the signal that ended it; 0 for none
    std::string output;
    std::string errors;
};

/// The settings of a program.
struct ProgramSettings {
    std::filesystem::path folder = "/"; ///< the working folder
    /// Overrides variables of the tests. Those of languages and of git are removed first.
    std::map<std::string, std::string> environment;
    rlim_t fileSize = RLIM_INFINITY; ///< the largest file; with the signal ignored, like a full disk
    bool withoutPrivileges = false;  ///< without root's capabilities: permissions apply to root, too
    bool onTerminal = false;         ///< standard output and error are one pseudo terminal
    bool inputOnTerminal = false;    ///< with onTerminal: standard input is the same one, which shows it, too
    bool inputStaysOpen = false;     ///< until the destructor; otherwise standard input ends at once
};

/// A program in a process of its own. The destructor ends it if it is still running.
class RunningProgram {
public:
    /// @param command the program's path and its arguments.
    /// @throws std::runtime_error if it cannot be started.
    RunningProgram(std::vector<std::string> const& command, ProgramSettings const& settings);
    ~RunningProgram();
    RunningProgram(RunningProgram const&) = delete;
    RunningProgram& operator=(RunningProgram const&) = delete;

    void sendSignal(int number) const;

    /// Waits for this many bytes of standard output, and closes it without reading the rest.
    std::string readAndClose(std::size_t length);

    /// Waits for a line on standard output, or on standard error. @return it without its end; an
    /// incomplete one if the program has ended, or after a long time.
    std::string readLine() const;
    std::string readErrorLine() const;

    /// Waits until the program sleeps, for input or for a lock. @return false if it has ended instead.
    bool waitUntilItSleeps() const;

    /// Feeds the program, and reads its output to the end. On a terminal, all of it is `output`.
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
