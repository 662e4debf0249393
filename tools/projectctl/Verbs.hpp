#pragma once

#include "cli/Command.hpp"

namespace projectctl {

/// All verbs of the tool, in the order in which help shows them: those with the same purpose are neighbours.
CommandList const& verbs();

} // namespace projectctl
