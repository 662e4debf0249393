#pragma once

#include <string>
#include <vector>

#include "cli/Command.hpp"
#include "completion/Candidates.hpp"

namespace projectctl {

/// The candidates for the last of some arguments of the tool: commands, options, and the values that they
/// accept. Enters the folders that -C names.
/// @param arguments at least one; the last one is being typed.
/// @throws std::exception if there cannot be any.
std::vector<Candidate> candidatesFor(std::vector<std::string> const& arguments, CommandList const& commands);

} // namespace projectctl
