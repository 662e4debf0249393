#pragma once

#include <memory>
#include <string>
#include <vector>

#include "cli/Command.hpp"

namespace projectctl {

/// Reads the command line, and runs the command that it calls for.
/// @param version what --version shows.
/// @param commands all commands, in the order in which help shows them.
/// @return the exit code: 0, 1 for a failure, 2 for a wrong use of the tool.
int runCommandLine(int argc, char const* const* argv, std::string const& version,
                   std::vector<std::unique_ptr<Command>> const& commands);

} // namespace projectctl
