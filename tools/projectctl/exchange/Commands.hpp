#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeImportCommand();
std::unique_ptr<Command> makeExportCommand();

} // namespace projectctl
