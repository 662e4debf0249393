#pragma once

#include <memory>

#include "project/session/Export.hpp"

namespace project::session {

class ChangeStep;

/// Several changes of a project as one step, which is in the project wholly or not at all: for other threads
/// and processes, for git's index and for observers, and after a crash or a power cut. Created by
/// Session::transaction.
///
///     auto transaction = session.transaction();
///     session.project().getLabelManager().createCategory(status);
///     session.project().getFileManager().add(files);
///     session.project().getFileManager().addLabels(files, {done});
///     transaction.commit();
///
/// Each operation sees the effects of the earlier ones. An operation that throws is rolled back alone, and
/// the transaction continues. Other threads wait for the project, and other processes that write wait as
/// well, so a transaction should not last longer than its operations need.
///
/// A transaction that begins while another one is open is nested: it joins the outer one when it is
/// committed, and only its own operations are rolled back when it is not. Transactions end in the reverse
/// order of their beginning. A transaction belongs to the thread that began it, and the session must outlive
/// it.
class PROJECT_SESSION_EXPORT Transaction {
public:
    Transaction(Transaction&& other) noexcept;
    Transaction& operator=(Transaction&&) = delete;

    /// Rolls everything back unless it was committed: the project and git's index are as before, and
    /// observers are not called.
    ~Transaction();

    /// Ends the transaction. A nested one leaves the rest to the outer one, which
    /// 1. writes all changes as one batch with one sync, passing all files to git in one call each for those
    ///    that are removed and those that are added,
    /// 2. writes git's index once, with the project's text if the session stages each change,
    /// 3. releases the guard and dispatches the events, in the order of the operations.
    ///
    /// Costs about as much as one of its operations with all files and labels.
    /// @throws stores::StoreError or git::GitError: the transaction is rolled back, unless the error's kind
    /// is
    ///         OutcomeUnknown. If only the text cannot be staged, the changes remain committed and observers
    ///         are called before the git::GitError is thrown.
    /// @throws std::logic_error if the transaction has ended already, if a nested one is still open, or on
    ///         another thread than the one that began it; nothing changes.
    void commit();

private:
    friend class Session;

    explicit Transaction(std::unique_ptr<ChangeStep> step);

    std::unique_ptr<ChangeStep> step_;
};

} // namespace project::session
