#pragma once

#include <string>
#include <vector>

#include <CLI/CLI.hpp>

namespace projectctl {

// The options that every command accepts. They may be anywhere among the arguments; the parser would accept
// them only before the command.

/// Declares them to the parser, for the help alone.
void declareCommonOptions(CLI::App& tool);

/// Applies them to settings() and to the outputs, and removes them from the arguments.
/// @return the folders to enter, one after the other.
/// @throws WrongUse for an option without its value, or with a wrong one.
std::vector<std::string> takeCommonOptions(std::vector<std::string>& arguments);

/// Their names.
std::vector<std::string> const& commonOptions();

/// Whether an argument is one of them, also with its value: --color=never.
bool isCommonOption(std::string const& argument);

/// Whether the argument after it is its value.
bool isBeforeItsValue(std::string const& option);

} // namespace projectctl
