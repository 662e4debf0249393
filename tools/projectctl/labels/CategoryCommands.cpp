#include "labels/CategoryCommands.hpp"

#include <utility>
#include <vector>

#include "cli/CommandGroup.hpp"
#include "labels/Commands.hpp"

namespace projectctl {

std::unique_ptr<Command> makeCategoryCommand() {
    std::vector<std::unique_ptr<Command>> members;
    members.push_back(makeCreateCategoryCommand());
    members.push_back(makeListCategoriesCommand());
    members.push_back(makeRenameCategoryCommand());
    members.push_back(makeDeleteCategoryCommand());
    return std::make_unique<CommandGroup>("category", std::move(members));
}

} // namespace projectctl
