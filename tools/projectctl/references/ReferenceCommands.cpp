#include "references/ReferenceCommands.hpp"

#include <string>
#include <utility>
#include <vector>

#include "cli/CommandGroup.hpp"
#include "references/Commands.hpp"

namespace projectctl {

namespace {

std::unique_ptr<Command> makeListCommands(std::string const& name, ReferenceList const& list) {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(makeAddReferencesCommand(list));
    members.push_back(makeListReferencesCommand(list));
    members.push_back(makeRemoveReferencesCommand(list));
    return std::make_unique<CommandGroup>(name, std::move(members));
}

} // namespace

std::unique_ptr<Command> makePathCommand() {
    return makeListCommands("path", projectPath());
}

std::unique_ptr<Command> makeReferenceCommand() {
    return makeListCommands("reference", projectReferences());
}

} // namespace projectctl
