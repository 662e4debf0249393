#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeInitCommand();
std::unique_ptr<Command> makeRootCommand();
std::unique_ptr<Command> makeNameCommand();
std::unique_ptr<Command> makeDescriptionCommand();
std::unique_ptr<Command> makeTidyCommand();

} // namespace projectctl
