#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

/// @param commands the commands that a batch may contain; borrowed.
std::unique_ptr<Command> makeBatchCommand(CommandList const& commands);

} // namespace projectctl
