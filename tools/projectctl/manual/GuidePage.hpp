#pragma once

#include <string>

#include "cli/VerbDescription.hpp"

namespace projectctl {

/// The page of the guide with all verbs of the tool, in Markdown.
std::string guidePageOf(VerbDescription const& tool);

} // namespace projectctl
