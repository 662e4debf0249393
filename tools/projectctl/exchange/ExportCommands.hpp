#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

// The members of the command group `export`.
std::unique_ptr<Command> makeExportCsvCommand();
std::unique_ptr<Command> makeExportJsonLinesCommand();
std::unique_ptr<Command> makeExportCodeOwnersCommand();
std::unique_ptr<Command> makeExportFilesCommand();

} // namespace projectctl
