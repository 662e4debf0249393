#pragma once

#include <functional>
#include <vector>

#include "project/session/DiskFolder.hpp"
#include "project/session/Query.hpp"

namespace project::session {

/// The files among some that were found on disk, and all files below the folders among them. Folders are
/// entered level by level, so that git can be asked once for each level, and nothing that it ignores is read.
/// @param choose returns those of a level that are taken or entered.
/// @param[out] unreadable receives the folders that cannot be read.
std::vector<FoundFile> filesOf(std::vector<FoundFile> found,
                               std::function<std::vector<FoundFile>(std::vector<FoundFile>)> const& choose,
                               std::vector<UnreadableFolder>& unreadable);

} // namespace project::session
