#pragma once

#include <cstddef>
#include <memory>

#include "cli/Command.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// @param addTree adds everything below the root to the new project, and returns the number of files and
/// folders.
std::unique_ptr<Command> makeInitCommand(std::size_t (*addTree)(OpenProject& project));
std::unique_ptr<Command> makeRootCommand();
std::unique_ptr<Command> makeNameCommand();
std::unique_ptr<Command> makeDescriptionCommand();
std::unique_ptr<Command> makeTidyCommand();

} // namespace projectctl
