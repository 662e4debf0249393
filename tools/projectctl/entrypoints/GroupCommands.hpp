#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

// The members of the command group `group`.
std::unique_ptr<Command> makeCreateGroupCommand();
std::unique_ptr<Command> makeListGroupsCommand();
std::unique_ptr<Command> makeRenameGroupCommand();
std::unique_ptr<Command> makeDeleteGroupCommand();

} // namespace projectctl
