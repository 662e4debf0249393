#pragma once

#include <cstdint>

#include <sys/stat.h>

#include "repository/Repository.hpp"
#include "rules/ContentRules.hpp"

namespace project::git {

/// Compares entries of the index with the files on disk. Reads a file only if its times and size do not
/// decide.
///
/// The times of an entry that is as young as the index do not decide: the file may have been changed within
/// the same tick of the clock (git's Documentation/technical/racy-git.txt).
class EntryComparison {
public:
    explicit EntryComparison(Repository const& repository) : repository_(repository), rules_(repository) {}

    /// Whether a file or link differs from its entry, which has the same type.
    bool isModified(git_index_entry const& entry, struct stat const& onDisk);

    /// Whether a new index with an entry of this second would hide a change of its file from git, which
    /// compares whole seconds.
    bool canHideChanges(std::int64_t seconds) const { return seconds >= repository_.indexStamp().seconds; }

private:
    bool isTouched(git_index_entry const& entry, struct stat const& onDisk) const;
    bool isContentModified(git_index_entry const& entry, struct stat const& onDisk);

    Repository const& repository_;
    ContentRules rules_;
};

/// The mode that git would record for a file or link.
/// @param tracked its entry in the index; null if there is none.
std::uint32_t modeOf(struct stat const& onDisk, git_index_entry const* tracked, DiskSettings const& settings);

/// Records the times, size and identity of a file in an entry, as git does.
void record(struct stat const& onDisk, git_index_entry& entry);

} // namespace project::git
