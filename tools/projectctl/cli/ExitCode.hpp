#pragma once

#include <exception>
#include <string_view>

namespace projectctl {

/// The exit codes of all commands except `merge`, which has those of a merge driver. `projectctl --help` and
/// the guide list them.
namespace exit_code {

inline constexpr int done = 0;
inline constexpr int failed = 1;         ///< the operation is not possible
inline constexpr int wrongUse = 2;       ///< the arguments are wrong
inline constexpr int finding = 3;        ///< the operation is done, and it has found a fault
inline constexpr int busy = 4;           ///< another program is at work: try again
inline constexpr int damaged = 5;        ///< the text is damaged or incomplete
inline constexpr int conflict = 6;       ///< the text contains conflict markers
inline constexpr int diskFailed = 7;     ///< the disk is full or fails, or a permission is missing
inline constexpr int outcomeUnknown = 8; ///< the change may be in the project or not

} // namespace exit_code

/// The word for an exit code, as in JSON: "busy".
std::string_view nameOf(int exitCode);

/// The exit code of a command that failed with an error.
int exitCodeFor(std::exception const& error);

} // namespace projectctl
