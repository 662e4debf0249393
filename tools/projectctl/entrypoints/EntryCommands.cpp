#include "entrypoints/EntryCommands.hpp"

#include <utility>
#include <vector>

#include "cli/CommandGroup.hpp"
#include "entrypoints/Commands.hpp"

namespace projectctl {

std::unique_ptr<Command> makeEntryCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(makeSetEntryCommand());
    members.push_back(makeListEntriesCommand());
    members.push_back(makeShowEntryCommand());
    members.push_back(makeRemoveEntryCommand());
    return std::make_unique<CommandGroup>("entry", std::move(members));
}

} // namespace projectctl
