#pragma once

#include <cstdint>
#include <optional>
#include <thread>

#include "cmlink/ReentrantReadWriteLock.hpp"
#include "project/stores/Export.hpp"

namespace project::stores {

class TreeMetadataManager;

/// Collects the writes of its thread into one batch, which is in the store wholly or not at all. Created by
/// TreeMetadataManager::transaction.
///
/// It holds the store's write guard. Inside, each write changes the tree at once, so that later operations
/// see it, and costs no disk access. Other threads and processes see nothing before the commit. Listeners
/// are notified once, at the commit, if nodes were set or removed: of removals, if any node was removed, and
/// then of additions, if any was set.
///
/// A transaction that begins while another one is open is nested: it joins the outer one when it is
/// committed, and only its own writes are rolled back when it is not. Transactions end in the reverse order
/// of their beginning; when an outer one is rolled back, the inner ones end with it.
///
/// It belongs to the thread that began it, as the guard does: no other thread may commit, move or destroy
/// it. The store must outlive it.
class PROJECT_STORES_EXPORT Transaction {
public:
    Transaction(Transaction&& other) noexcept;
    Transaction& operator=(Transaction&&) = delete;

    /// Rolls back unless it was committed: the tree is as it was at the beginning of the transaction, and no
    /// listener is notified.
    ~Transaction();

    /// False if it was committed, or was rolled back with an outer one.
    bool isOpen() const noexcept;

    /// Ends the transaction. The outermost one writes one batch, notifies the listeners, makes the batch
    /// durable, and releases the guard; it costs about as much as one write with the same nodes. A nested one
    /// leaves its writes to the outer one.
    /// @throws std::logic_error if the transaction has ended already, if a nested one is still open, or on
    ///         another thread than the one that began it; nothing changes.
    /// @throws an exception of the store or of a listener, as a write does. The transaction is rolled back
    ///         then, unless it is a StoreError whose kind is OutcomeUnknown.
    void commit();

private:
    friend class TreeMetadataManager;

    Transaction(TreeMetadataManager& store, cmlink::ReentrantReadWriteLock::LockGuard guard,
                std::uint64_t number);

    void requireInnermost() const;

    TreeMetadataManager* store_; ///< null if the transaction was moved from
    std::optional<cmlink::ReentrantReadWriteLock::LockGuard> guard_; ///< empty if it has ended
    std::uint64_t number_;
    std::thread::id thread_ = std::this_thread::get_id();
};

} // namespace project::stores
