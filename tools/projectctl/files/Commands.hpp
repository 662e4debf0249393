#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeAddCommand();
std::unique_ptr<Command> makeRemoveCommand();
std::unique_ptr<Command> makeMoveCommand();
std::unique_ptr<Command> makeListCommand();

} // namespace projectctl
