#pragma once

#include <memory>

#include "cli/Command.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

// The members of the group `shared`, and what they have in common.

std::unique_ptr<Command> makeSharedStatusCommand();
std::unique_ptr<Command> makeSharedTidyCommand();
std::unique_ptr<Command> makeSharedLogCommand();
std::unique_ptr<Command> makeSharedRolesCommand();

/// The log of a project.
/// @throws Failure if the project is not shared.
project::stores::JournalBackend& requireLog(OpenProject& project);

/// A time as "2024-05-31 17:08:59 UTC".
std::string shownTime(std::chrono::system_clock::time_point time);

/// A time as JSON documents contain it, "2024-05-31T17:08:59Z".
std::u16string timeInJson(std::chrono::system_clock::time_point time);

} // namespace projectctl
