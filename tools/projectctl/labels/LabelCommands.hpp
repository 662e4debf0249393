#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

// The members of the command group `label`. Three are about the labels of a category:
std::unique_ptr<Command> makeCreateLabelCommand();
std::unique_ptr<Command> makeListLabelsCommand();
std::unique_ptr<Command> makeDeleteLabelCommand();

// Four are about the labels on files:
std::unique_ptr<Command> makePutLabelCommand();
std::unique_ptr<Command> makeTakeLabelCommand();
std::unique_ptr<Command> makeShowLabelsCommand();
std::unique_ptr<Command> makeFindLabelCommand();

} // namespace projectctl
