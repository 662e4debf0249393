#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "project/metadata/MetadataManager.hpp"
#include "project/stores/Backend.hpp"
#include "project/stores/Transaction.hpp"

namespace project::stores {

/// The metadata store of the library: a tree in memory, which is loaded level by level from a backend on
/// request and written through to it.
///
/// A write has these steps: nodes that are equal to the stored ones are left out; the tree changes; the
/// backend writes; the listeners are notified; the backend keeps. If a step throws, the backend discards, the
/// tree returns to its previous state, listeners that were already notified are notified of the reverse, and
/// the exception propagates to the caller. In a transaction only the first two steps happen at once; the
/// others happen at its commit, for all writes together.
class PROJECT_STORES_EXPORT TreeMetadataManager : public metadata::MetadataManager {
public:
    /// @param metadataRoot the folder with the backend's files, absolute; nothing is read here.
    TreeMetadataManager(std::unique_ptr<Backend> backend, Path metadataRoot);
    ~TreeMetadataManager() override;

    cmlink::ReentrantReadWriteLock::LockGuard acquireReadLock() override;
    cmlink::ReentrantReadWriteLock::LockGuard acquireWriteLock() override;
    Path getMetadataRoot() override;
    std::unique_ptr<metadata::MetadataNode> getNode(metadata::MetadataPath const& path) override;
    /// As metadata::MetadataManager::setNodes.
    void setNodes(std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>>& nodes) override;
    bool hasNode(metadata::MetadataPath const& path) override;
    std::vector<metadata::MetadataPath> getChildNodes(metadata::MetadataPath const& path) override;
    /// As metadata::MetadataManager::subscribe.
    void subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) override;
    /// As metadata::MetadataManager::removeNodes.
    void removeNodes(std::vector<metadata::MetadataPath>& paths) override;
    /// As metadata::MetadataManager::createPaths.
    void createPaths(std::vector<metadata::MetadataPath>& paths) override;
    bool pathExists(metadata::MetadataPath path) override;

    /// Passes on the addresses directly below one address, with their nodes, as this thread sees them. Unlike
    /// getChildNodes it copies nothing and keeps nothing in memory that was not there before, so it is the
    /// fastest way to read a large part of the tree once. Takes the read lock.
    /// @param children must not use the store.
    void loadChildren(metadata::MetadataPath const& path, ChildSink& children);

    /// Takes the write guard and begins a transaction, which the writes of this thread belong to until it
    /// ends. If one is open already, the new one is nested in it.
    /// @throws std::system_error (resource_deadlock_would_occur) if this thread has read guards only.
    /// @throws StoreError if another process holds the lock, as a write does, or in a listener that is being
    ///         notified of a write.
    Transaction transaction();

    /// The changes of other processes since the last call, or since the first guard if this is the first
    /// call: one difference for each address, sorted, from before its first change to after its last. An
    /// address that is as it was before is left out.
    ///
    /// Takes the read lock, and therefore checks for changes unless a guard is open. Between two calls, both
    /// nodes of each address that others have changed stay in memory.
    Changes takeOthersChanges();

private:
    friend class Transaction;
    class State;

    bool isOpen(std::uint64_t transaction) const noexcept;
    bool isInnermost(std::uint64_t transaction) const noexcept;
    void commitInnermost();
    void rollBack(std::uint64_t transaction) noexcept;

    std::unique_ptr<State> state_;
};

} // namespace project::stores
