#pragma once

#include <cstddef>

#include "project/OpenProject.hpp"

namespace projectctl {

/// Several changes of an open project as one step, which is rolled back unless it is committed. Transactions
/// may be nested, as those of a session.
class ProjectTransaction {
public:
    /// Takes the store's write guard until the transaction ends.
    /// @throws StoreError if another process holds the lock.
    explicit ProjectTransaction(OpenProject& project);
    ~ProjectTransaction();
    ProjectTransaction(ProjectTransaction const&) = delete;
    ProjectTransaction& operator=(ProjectTransaction const&) = delete;

    /// @throws as project::session::Transaction::commit. The command stages the text after it.
    void commit();

private:
    OpenProject& project_;
    project::session::Transaction changes_;
    std::size_t earlierReturned_;
    bool isCommitted_ = false;
};

} // namespace projectctl
