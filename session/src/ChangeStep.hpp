#pragma once

#include "ChangeExecutor.hpp"
#include "TransactionFiles.hpp"
#include "project/stores/Transaction.hpp"

namespace project::session {

/// One change of a session:
///
/// 1. It takes the store's write guard and begins a transaction of the store.
/// 2. The managers note paths for source control, write the store and raise events, which the event queue
///    collects. A step that ends without a commit is rolled back, and its events are dropped.
/// 3. The outermost step commits: the store writes one batch and notifies source control, which prepares its
///    change of git's index. A failure rolls the step back, with the prepared change.
///    Then the personal text is committed, if the step has changed it. A failure of that is thrown at the
///    end.
/// 4. It adds the text to the prepared change, if the session stages each change, and writes git's index.
/// 5. It releases the guard and dispatches the events.
///
/// The guard covers steps 2 to 4 because the store notifies its listeners of every commit: without it, the
/// commit of another thread would stage, or remove from git's index, paths of an operation that has not
/// happened yet.
class ChangeStep {
public:
    /// Of a transaction, source control gets only the files of the operations that have not been rolled back.
    enum class Kind { Operation, Transaction };

    ChangeStep(ChangeExecutor& executor, Kind kind);
    ChangeStep(ChangeStep const&) = delete;
    ChangeStep& operator=(ChangeStep const&) = delete;

    /// Rolls back, unless the step is committed.
    ~ChangeStep();

    /// Ends the step. A nested step leaves everything else to the outer one.
    /// @throws std::logic_error as stores::Transaction::commit; nothing changes.
    /// @throws an exception of the store or of source control: the step is rolled back. Otherwise the error
    ///         of the personal text, whose changes are rolled back, else the error of staging, else the
    ///         exception of a slot: the step is committed, and the events were dispatched.
    void commit();

private:
    void commitWrites();
    void commitOutermost();
    void end() noexcept;
    void drop() noexcept;
    void abandon() noexcept;

    bool isOutermost() const noexcept { return depth_ == 1; }

    ChangeExecutor& executor_;
    Kind kind_;
    stores::Transaction writes_;
    std::size_t depth_;
    std::size_t earlierEvents_;
    TransactionFiles::Mark earlierFiles_;
    std::size_t earlierMoves_;
};

} // namespace project::session
