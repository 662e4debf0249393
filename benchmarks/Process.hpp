#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace project::benchmarks {

/// Runs a program in a folder, to its end, with its output to /dev/null.
/// @throws std::runtime_error when it cannot be run or fails.
void runSilently(std::filesystem::path const& folder, std::vector<std::string> const& command);

} // namespace project::benchmarks
