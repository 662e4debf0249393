#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace projectctl {

/// The exit code and the output of a program.
struct ProcessResult {
    int exitCode; ///< -1 when the program was ended by a signal
    std::string output;
    std::string errors;
};

/// Runs a program with a given standard input and waits for its end. It writes to the standard output and the
/// standard error of the tool.
/// @return its exit code; -1 when it was ended by a signal.
/// @throws std::system_error when it cannot be started.
int runVisibly(std::vector<std::string> const& command, std::string_view input);

/// Runs a program with a given standard input and waits for its end. Writes and reads at the same time, so
/// that input and output of any size cannot block each other.
/// @param command the program, which is searched on the PATH, and its arguments; no shell interprets them.
/// @throws std::system_error when it cannot be started.
ProcessResult runWithInput(std::vector<std::string> const& command, std::string_view input);

} // namespace projectctl
