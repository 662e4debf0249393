#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "git/RawChanges.hpp"

namespace projectctl {

/// A commit, and its changes to one of its parents.
struct LoggedCommit {
    std::string id;
    std::vector<std::string> parents;
    std::string author;
    std::string time; ///< of the author, in ISO 8601
    std::string subject;
    std::string parent; ///< the parent to which the changes refer; empty for a first commit
    std::vector<RawChange> changes;
};

/// Runs `git log` and reads the commits with their changes, the youngest first. A merge is in the list once
/// for each of its parents.
/// @param options further options, revisions and paths.
/// @throws Failure if git refuses them.
std::vector<LoggedCommit> readCommitLog(fl::filesystem::Path const& folder,
                                        std::vector<std::string> const& options);

/// The same from git's output, which must be in the form that readCommitLog requests.
std::vector<LoggedCommit> commitsIn(std::string_view log);

} // namespace projectctl
