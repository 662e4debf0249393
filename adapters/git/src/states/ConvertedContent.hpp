#pragma once

#include <optional>
#include <string>

#include "repository/Repository.hpp"

namespace project::git {

/// The content of a file of the work tree as git stores it: with other line ends, for example. Nothing, with
/// libgit2's error set, if it cannot be converted.
/// @param content of the file on disk.
std::optional<std::string> convertedContent(Repository const& repository, TreePath const& path,
                                            std::string const& content);

} // namespace project::git
