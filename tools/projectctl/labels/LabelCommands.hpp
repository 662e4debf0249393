#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

// The commands about the labels that there are.
std::unique_ptr<Command> makeCreateLabelCommand();
std::unique_ptr<Command> makeListLabelsCommand();
std::unique_ptr<Command> makeDeleteLabelCommand();

// The commands about the labels on files.
std::unique_ptr<Command> makePutLabelCommand();
std::unique_ptr<Command> makeTakeLabelCommand();
std::unique_ptr<Command> makeShowLabelsCommand();
std::unique_ptr<Command> makeFindLabelCommand();

} // namespace projectctl
