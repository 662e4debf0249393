#pragma once

#include <string>

#include "cli/VerbDescription.hpp"

namespace projectctl {

/// The name of the manual page of a verb, or of the tool: "projectctl-label".
std::string manualNameOf(VerbDescription const& verb);

/// The manual page of a verb, with those of its members, or of the whole tool, in mdoc.
/// @param date in the form "November 2, 2026".
std::string manualPageOf(VerbDescription const& verb, std::string const& date);

} // namespace projectctl
