#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

// The members of the command group `import`.
std::unique_ptr<Command> makeImportGitCommand();
std::unique_ptr<Command> makeImportCompileCommandsCommand();
std::unique_ptr<Command> makeImportCodeOwnersCommand();
std::unique_ptr<Command> makeImportCsvCommand();
std::unique_ptr<Command> makeImportJsonLinesCommand();

} // namespace projectctl
