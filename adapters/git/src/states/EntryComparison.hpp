#pragma once

#include <cstdint>

#include <sys/stat.h>

#include "repository/Repository.hpp"
#include "rules/ContentRules.hpp"

namespace project::git {

/// Compares entries of the index with what is on disk, reading a file only when its times and size don't
/// tell.
///
/// An entry that is as young as the index says nothing by its times: the file may have been changed after
/// it, within one tick of the clock (git's Documentation/technical/racy-git.txt).
class EntryComparison {
public:
    explicit EntryComparison(Repository const& repository) : repository_(repository), rules_(repository) {}

    /// Whether a file or a link is other than its entry, which is of the same type.
    bool isModified(git_index_entry const& entry, struct stat const& onDisk);

    /// Whether an entry's file could be changed without showing once the index is written anew: that is so
    /// for git, which looks at whole seconds.
    bool hidesChanges(git_index_entry const& entry) const;

private:
    bool isTouched(git_index_entry const& entry, struct stat const& onDisk) const;
    bool isContentModified(git_index_entry const& entry, struct stat const& onDisk);

    Repository const& repository_;
    ContentRules rules_;
};

/// The mode that git would record for a file or a link.
/// @param tracked what the index has for it; may be null.
std::uint32_t modeOf(struct stat const& onDisk, git_index_entry const* tracked, DiskSettings const& settings);

/// Records the times, size and identity of a file in an entry, as git does.
void record(struct stat const& onDisk, git_index_entry& entry);

} // namespace project::git
