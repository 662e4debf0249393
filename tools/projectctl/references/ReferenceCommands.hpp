#pragma once

#include <memory>

#include "cli/Command.hpp"
#include "references/ReferenceLists.hpp"

namespace projectctl {

// The members of the command groups `path` and `reference`. The list is borrowed.
std::unique_ptr<Command> makeAddReferencesCommand(ReferenceList const& list);
std::unique_ptr<Command> makeListReferencesCommand(ReferenceList const& list);
std::unique_ptr<Command> makeRemoveReferencesCommand(ReferenceList const& list);

} // namespace projectctl
