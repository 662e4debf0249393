#pragma once

#include "index/IndexChanges.hpp"
#include "index/IndexLock.hpp"
#include "repository/Repository.hpp"
#include "states/EntryComparison.hpp"

namespace project::git {

/// Writes an index anew with some changes, in one pass over it, and once.
///
/// Every other entry stays as it is, with its flags and conflicts. What git can make again is left out: the
/// cached trees, the list of untracked files, the memory of resolved conflicts. The repository's own object
/// is not changed, so that nothing has to be undone when this fails.
class IndexWriter {
public:
    /// @param repository read since the lock is held.
    IndexWriter(Repository& repository, IndexLock const& lock);

    /// @throws GitError when it can't be written; the old index stays.
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
