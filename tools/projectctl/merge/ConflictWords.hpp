#pragma once

#include <string>

#include "project/stores/MergeConflict.hpp"

namespace projectctl {

/// A conflict of a merge in words of the project, in UTF-8: one clause.
std::string inWords(project::stores::MergeConflict const& conflict);

} // namespace projectctl
