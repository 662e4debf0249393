#pragma once

#include <string>
#include <vector>

namespace projectctl {

/// Replaces this process by the program "projectctl-VERB" on the PATH. Returns if there is no such program.
/// @param arguments of the verb.
void callExternalVerb(std::string const& verb, std::vector<std::string> const& arguments);

} // namespace projectctl
