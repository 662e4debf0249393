#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

std::unique_ptr<Command> makeCategoryCommand();
std::unique_ptr<Command> makeLabelCommand();

} // namespace projectctl
