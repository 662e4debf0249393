#pragma once

#include <memory>
#include <string>
#include <vector>

#include "cli/Command.hpp"

namespace projectctl {

/// Parses the command line, and runs the command that it calls. Only the command that it names is created;
/// for help and for errors, all of them.
/// @param version the text that --version shows.
/// @return the exit code, as in ExitCode.hpp.
/// @throws WrongUse, or the error of the command.
int runCommandLine(int argc, char const* const* argv, std::string const& version,
                   CommandList const& commands);

/// Parses a command with its arguments, without running it.
/// @param words the command's name and its arguments, without options that every command accepts.
/// @return the command; of a group, its member.
/// @throws WrongUse also for --help.
std::unique_ptr<Command> parseCommand(std::vector<std::string> const& words, CommandList const& commands);

} // namespace projectctl
