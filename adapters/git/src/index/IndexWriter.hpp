#pragma once

#include "index/IndexChanges.hpp"
#include "index/IndexLock.hpp"
#include "repository/Repository.hpp"
#include "states/EntryComparison.hpp"

namespace project::git {

/// Writes a new index with the changes of one call, in one pass over the old index.
///
/// All other entries stay unchanged, with their flags and conflicts. Parts that git can create again are left
/// out: the cached trees, the list of untracked files, the record of resolved conflicts. The repository's own
/// object is not changed, so that a failure needs no roll back.
class IndexWriter {
public:
    /// @param repository read after the lock was taken.
    IndexWriter(Repository& repository, IndexLock const& lock);

    /// @throws GitError if it cannot be written; the old index stays.
    void write(IndexChanges const& changes);

private:
    void keep(git_index_entry const& entry);
    void add(git_index_entry const& entry);

    Repository& repository_;
    IndexLock const& lock_;
    EntryComparison comparison_;
    IndexHandle result_;
};

} // namespace project::git
