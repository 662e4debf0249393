#include "Commands.hpp"

namespace projectctl {

std::vector<std::unique_ptr<Command>> makeCommands() {
    std::vector<std::unique_ptr<Command>> result;
    for (auto* const make :
         {makeInitCommand,      makeNameCommand,       makeDescriptionCommand, makeAddCommand,
          makeRemoveCommand,    makeListCommand,       makeStatusCommand,      makeCategoryCommand,
          makeLabelCommand,     makeEntryCommand,      makeGroupCommand,       makePathCommand,
          makeReferenceCommand, makeReferencesCommand, makeCheckCommand,       makeWatchCommand,
          makeTidyCommand,      makeSetupCommand,      makeMergeCommand,       makeResolveCommand}) {
        result.push_back(make());
    }
    return result;
}

} // namespace projectctl
