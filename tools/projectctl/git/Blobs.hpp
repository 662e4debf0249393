#pragma once

#include <cstdint>
#include <map>
#include <set>
#include <string>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

/// Reads contents from a repository, all of them by one process of git.
/// @return the contents by their ids. Ids of zeros, which git writes for no content, have an empty one.
/// @throws Failure if one is missing.
std::map<std::string, std::string> readBlobs(fl::filesystem::Path const& folder,
                                             std::set<std::string> const& ids);

/// The sizes of contents in bytes, by their ids, without reading the contents. Those that are missing are
/// left out, and so are ids of zeros. One process of git reads all of them.
std::map<std::string, std::uint64_t> readBlobSizes(fl::filesystem::Path const& folder,
                                                   std::set<std::string> const& ids);

} // namespace projectctl
