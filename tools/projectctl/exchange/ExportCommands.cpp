#include <utility>
#include <vector>

#include "cli/CommandGroup.hpp"
#include "exchange/Commands.hpp"
#include "exchange/ExportCommands.hpp"

namespace projectctl {

std::unique_ptr<Command> makeExportCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(makeExportCsvCommand());
    members.push_back(makeExportJsonLinesCommand());
    members.push_back(makeExportCodeOwnersCommand());
    members.push_back(makeExportFilesCommand());
    return std::make_unique<CommandGroup>("export", std::move(members));
}

} // namespace projectctl
