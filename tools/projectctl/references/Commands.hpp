#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makePathCommand();
std::unique_ptr<Command> makeReferenceCommand();
std::unique_ptr<Command> makeReferencesCommand();

} // namespace projectctl
