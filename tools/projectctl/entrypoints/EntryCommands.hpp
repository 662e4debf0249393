#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

// The members of the command group `entry`.
std::unique_ptr<Command> makeSetEntryCommand();
std::unique_ptr<Command> makeListEntriesCommand();
std::unique_ptr<Command> makeShowEntryCommand();
std::unique_ptr<Command> makeRemoveEntryCommand();

} // namespace projectctl
