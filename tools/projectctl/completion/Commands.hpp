#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

/// The name of the hidden command that the completions of the shells call.
inline constexpr char const* completeCommandName = "__complete";

/// @param commands those of the tool, with this one. Borrowed.
std::unique_ptr<Command> makeCompleteCommand(CommandList const& commands);

} // namespace projectctl
