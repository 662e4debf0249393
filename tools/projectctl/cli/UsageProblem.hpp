#pragma once

#include <string>

#include <CLI/CLI.hpp>

#include "cli/CodedFailure.hpp"

namespace projectctl {

/// The error for arguments that the parser refuses: what is wrong, the name that was probably meant, and the
/// command that shows the help.
/// @param tool the parser.
WrongUse wrongUse(CLI::ParseError const& error, CLI::App const& tool);

/// The same for a word that is not a verb of a group or of the tool.
Message unknownVerb(CLI::App const& group, std::string const& word);

} // namespace projectctl
