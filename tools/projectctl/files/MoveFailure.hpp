#pragma once

#include "output/Failure.hpp"
#include "project/session/Move.hpp"

namespace projectctl {

/// The error for a move that the session refuses, with both paths as the user sees them.
Failure failureOf(project::session::MoveError const& error);

} // namespace projectctl
