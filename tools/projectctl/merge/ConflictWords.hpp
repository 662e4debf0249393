#pragma once

#include <string>

#include "project/stores/MergeConflict.hpp"

namespace projectctl {

/// A conflict of a merge as one clause for the user, in UTF-8.
std::string inWords(project::stores::MergeConflict const& conflict);

} // namespace projectctl
