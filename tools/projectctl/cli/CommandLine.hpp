#pragma once

#include <memory>
#include <string>
#include <vector>

#include "cli/Command.hpp"

namespace projectctl {

/// Parses the command line, and runs the command that it calls.
/// @param version the text that --version shows.
/// @param commands all commands, in the order in which help shows them.
/// @return the exit code, as in ExitCode.hpp.
int runCommandLine(int argc, char const* const* argv, std::string const& version,
                   std::vector<std::unique_ptr<Command>> const& commands);

} // namespace projectctl
