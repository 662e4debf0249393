#pragma once

#include <cstdint>
#include <vector>

#include "project/stores/Change.hpp"
#include "tree/ListenerList.hpp"
#include "tree/MetadataTree.hpp"

namespace project::stores {

/// The writes that have changed the tree and are not yet committed, and the transactions that are open.
///
/// Used by one thread at a time, under the store's write guard.
class WriteLog {
public:
    /// @param tree borrowed.
    explicit WriteLog(MetadataTree& tree) : tree_(tree) {}

    /// Applies a batch to the tree. If it throws, nothing has changed.
    void apply(Batch batch, ListenerList::Always always);

    /// Begins a transaction. @return its number.
    std::uint64_t begin();

    bool isInTransaction() const noexcept { return !open_.empty(); }

    bool isOpen(std::uint64_t transaction) const noexcept;

    bool isInnermost(std::uint64_t transaction) const noexcept;

    /// Ends the innermost transaction and keeps its writes.
    void end() noexcept;

    /// Ends a transaction and all that are nested in it, and undoes their writes. Does nothing if it has
    /// ended already.
    void rollBack(std::uint64_t transaction) noexcept;

    /// The notifications that the writes require.
    ListenerList::Always always() const noexcept;

    /// Moves the batches of all writes into one. The writes can still be undone.
    Batch takeBatch();

    /// Undoes all writes, the last one first.
    void undoAll() noexcept { undoFrom(0); }

    /// Forgets all writes: they are committed.
    void clear() noexcept { writes_.clear(); }

private:
    struct Write {
        Batch batch;
        ListenerList::Always always;
        MetadataTree::Undo undo;
    };

    struct OpenTransaction {
        std::uint64_t number;
        std::size_t firstWrite;
    };

    void undoFrom(std::size_t firstWrite) noexcept;

    MetadataTree& tree_;
    std::vector<Write> writes_;
    std::vector<OpenTransaction> open_; ///< the innermost one is the last
    std::uint64_t lastNumber_ = 0;
};

} // namespace project::stores
