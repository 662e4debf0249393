#include "labels/LabelCommands.hpp"

#include <utility>
#include <vector>

#include "cli/CommandGroup.hpp"
#include "labels/Commands.hpp"

namespace projectctl {

std::unique_ptr<Command> makeLabelCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(makeCreateLabelCommand());
    members.push_back(makeListLabelsCommand());
    members.push_back(makeDeleteLabelCommand());
    members.push_back(makePutLabelCommand());
    members.push_back(makeTakeLabelCommand());
    members.push_back(makeShowLabelsCommand());
    members.push_back(makeFindLabelCommand());
    return std::make_unique<CommandGroup>("label", std::move(members));
}

} // namespace projectctl
