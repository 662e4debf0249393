#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeSetupCommand();
std::unique_ptr<Command> makeMergeCommand();
std::unique_ptr<Command> makeResolveCommand();

} // namespace projectctl
