#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeLogCommand();
std::unique_ptr<Command> makeDiffCommand();
std::unique_ptr<Command> makeTextconvCommand();

} // namespace projectctl
