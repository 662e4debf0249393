#pragma once

#include <memory>

#include "cli/Command.hpp"

namespace projectctl {

// The members of the command group `category`.
std::unique_ptr<Command> makeCreateCategoryCommand();
std::unique_ptr<Command> makeListCategoriesCommand();
std::unique_ptr<Command> makeRenameCategoryCommand();
std::unique_ptr<Command> makeDeleteCategoryCommand();

} // namespace projectctl
