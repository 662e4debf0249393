#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeEntryCommand();
std::unique_ptr<Command> makeGroupCommand();

} // namespace projectctl
