#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace projectctl {

/// How a program ended, and what it wrote.
struct ProcessResult {
    int exitCode; ///< -1 when a signal ended it
    std::string output;
    std::string errors;
};

/// Runs a program to its end, with the input given on its standard input. Feeds and reads at the same time,
/// so that neither side waits for the other, whatever the sizes.
/// @param command the program, looked for on the search path, and its arguments; no shell reads them.
/// @throws std::system_error when it cannot be started.
ProcessResult runWithInput(std::vector<std::string> const& command, std::string_view input);

} // namespace projectctl
