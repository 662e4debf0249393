#pragma once

#include <functional>
#include <memory>
#include <set>
#include <string>

#include "index/IndexChanges.hpp"
#include "index/IndexLock.hpp"
#include "repository/Repository.hpp"

namespace project::git {

/// Changes of git's index that become visible to git in one write. Holds git's lock of the index, so nothing
/// that other programs change is lost. Unless it is published, nothing is changed.
class IndexUpdate {
public:
    /// Takes the lock and reads the index.
    /// @param repository shows the changes from now on.
    /// @throws GitError if the index is locked or cannot be read.
    explicit IndexUpdate(Repository& repository);

    /// Releases the lock.
    ~IndexUpdate();
    IndexUpdate(IndexUpdate const&) = delete;
    IndexUpdate& operator=(IndexUpdate const&) = delete;

    /// Prepares changes: the repository shows them, and the disk has space for them.
    /// @throws GitError if the index cannot contain them, or there is no space; they are not prepared.
    void apply(IndexChanges const& changes);

    /// Writes the index, if there are changes. Call it once.
    /// @throws GitError if it cannot be written; the old index stays.
    void publish();

private:
    void requireValidNames(IndexChanges const& changes) const;
    void markHiddenChanges();

    Repository& repository_;
    IndexLock const lock_;
    std::shared_ptr<IndexContent const> old_;
    std::shared_ptr<IndexContent> new_; ///< null if nothing has changed
    std::set<std::string, std::less<>> staged_;
};

} // namespace project::git
