#include "Commands.hpp"

namespace projectctl {

std::vector<std::unique_ptr<Command>> makeCommands() {
    std::vector<std::unique_ptr<Command>> result;
    for (auto* const make :
         {makeInitCommand, makeNameCommand, makeDescriptionCommand, makeAddCommand, makeListCommand,
          makeStatusCommand, makeCategoryCommand, makeLabelCommand, makeCheckCommand, makeTidyCommand}) {
        result.push_back(make());
    }
    return result;
}

} // namespace projectctl
