#include "entrypoints/GroupCommands.hpp"

#include <utility>
#include <vector>

#include "cli/CommandGroup.hpp"
#include "entrypoints/Commands.hpp"

namespace projectctl {

std::unique_ptr<Command> makeGroupCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(makeCreateGroupCommand());
    members.push_back(makeListGroupsCommand());
    members.push_back(makeRenameGroupCommand());
    members.push_back(makeDeleteGroupCommand());
    return std::make_unique<CommandGroup>("group", std::move(members));
}

} // namespace projectctl
