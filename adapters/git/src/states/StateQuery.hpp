#pragma once

#include "cmlink/LocalStatus.hpp"
#include "repository/Repository.hpp"
#include "states/EntryComparison.hpp"
#include "states/WorkTreeFolders.hpp"

namespace project::git {

/// Determines the states for one call.
class StateQuery {
public:
    explicit StateQuery(Repository& repository)
        : repository_(repository), folders_(repository), comparison_(repository) {}

    cmlink::LocalStatus stateOf(fl::filesystem::Path const& path);

    /// Whether `git add` of the folders above would leave a path out: ignored, or not in this repository.
    bool isIgnored(fl::filesystem::Path const& path);

    /// Whether a path is tracked and missing on disk on purpose.
    bool isLeftOut(fl::filesystem::Path const& path);

private:
    cmlink::LocalStatus trackedState(git_index_entry const& entry);
    cmlink::LocalStatus presentState(git_index_entry const& entry, struct stat const& onDisk);
    cmlink::LocalStatus submoduleState(git_index_entry const& entry, struct stat const& onDisk) const;
    cmlink::LocalStatus untrackedState(TreePath const& path);
    std::optional<struct stat> reachableEntry(TreePath const& path);
    bool isDiskIgnored(git_index_entry const& entry, bool isOnDisk) const;

    Repository& repository_;
    WorkTreeFolders folders_;
    EntryComparison comparison_;
};

} // namespace project::git
