#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "git/CommitLog.hpp"
#include "history/GitProject.hpp"
#include "output/Progress.hpp"
#include "project/LabelsOnFile.hpp"

namespace projectctl {

/// The counts of a definition in one commit.
struct Version {
    LoggedCommit commit;
    std::size_t files = 0;
    std::size_t folders = 0;
    std::map<LabelUUIDs, std::size_t> labels; ///< how many files have each
};

/// The names of a label, as the latest version with it has them.
struct LabelName {
    std::u16string category;
    std::u16string label;
};

/// Files and labels over time.
struct History {
    std::vector<Version> versions; ///< the oldest first
    std::map<LabelUUIDs, LabelName> labels;
    std::size_t omitted = 0; ///< versions between these that were not read
};

/// Reads the history of the main line from git: the first, the last and at most some sixty versions between
/// them, evenly distributed, so that a long history of a large project does not take long. Versions that
/// cannot be read are left out. Also follows a project whose root was moved in the repository.
History readHistory(GitProject const& project, Progress& progress);

/// The latest commit that changed the definition; nothing if none did.
std::optional<LoggedCommit> lastChangeOf(GitProject const& project);

} // namespace projectctl
