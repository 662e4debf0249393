#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace project::benchmarks {

/// Runs a program in a folder, with its output to /dev/null, and waits for its end.
/// @throws std::runtime_error if it cannot be run or fails.
void runSilently(std::filesystem::path const& folder, std::vector<std::string> const& command);

} // namespace project::benchmarks
