#include "exchange/ImportCommands.hpp"

#include <utility>
#include <vector>

#include "cli/CommandGroup.hpp"
#include "exchange/Commands.hpp"

namespace projectctl {

std::unique_ptr<Command> makeImportCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(makeImportGitCommand());
    members.push_back(makeImportCompileCommandsCommand());
    members.push_back(makeImportCodeOwnersCommand());
    members.push_back(makeImportCsvCommand());
    members.push_back(makeImportJsonLinesCommand());
    return std::make_unique<CommandGroup>("import", std::move(members));
}

} // namespace projectctl
