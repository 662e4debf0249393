#pragma once

#include <string>

namespace projectctl {

/// A text of texts/verbs in the language of the process, in UTF-8.
/// @param name as that folder's root.txt explains: "list", "list: details", "list --tree".
/// @return empty if there is no such text.
std::string verbText(std::string const& name);

} // namespace projectctl
