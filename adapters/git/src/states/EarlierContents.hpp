#pragma once

#include <map>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "repository/Repository.hpp"

namespace project::git {

/// As GitAdapter::earlierContents.
/// @param writer in the work tree; empty for the whole of it.
std::map<fl::filesystem::Path, std::string> earlierContents(Repository& repository,
                                                            std::vector<fl::filesystem::Path> const& files,
                                                            TreePath const& writer);

} // namespace project::git
