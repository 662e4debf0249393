#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

/// The verb `help`, which shows how a verb is used.
/// @param verbs of the tool.
std::unique_ptr<Command> makeHelpCommand(CommandList const& verbs);

} // namespace projectctl
