#pragma once

#include <memory>
#include <vector>

#include "Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeInitCommand();
std::unique_ptr<Command> makeNameCommand();
std::unique_ptr<Command> makeDescriptionCommand();
std::unique_ptr<Command> makeAddCommand();
std::unique_ptr<Command> makeRemoveCommand();
std::unique_ptr<Command> makeListCommand();
std::unique_ptr<Command> makeStatusCommand();
std::unique_ptr<Command> makeCategoryCommand();
std::unique_ptr<Command> makeLabelCommand();
std::unique_ptr<Command> makeEntryCommand();
std::unique_ptr<Command> makeGroupCommand();
std::unique_ptr<Command> makePathCommand();
std::unique_ptr<Command> makeReferenceCommand();
std::unique_ptr<Command> makeReferencesCommand();
std::unique_ptr<Command> makeCheckCommand();
std::unique_ptr<Command> makeTidyCommand();
std::unique_ptr<Command> makeWatchCommand();
std::unique_ptr<Command> makeSetupCommand();
std::unique_ptr<Command> makeMergeCommand();
std::unique_ptr<Command> makeResolveCommand();

/// All commands, in the order in which help shows them.
std::vector<std::unique_ptr<Command>> makeCommands();

} // namespace projectctl
