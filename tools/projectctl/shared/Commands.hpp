#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeCopyCommand();
std::unique_ptr<Command> makeSharedCommand();

} // namespace projectctl
