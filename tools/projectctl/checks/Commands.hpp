#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeStatusCommand();
std::unique_ptr<Command> makeCheckCommand();

} // namespace projectctl
