#pragma once

#include <map>
#include <memory>
#include <vector>

#include "cmlink/ReentrantReadWriteLock.hpp"
#include "fl/filesystem/Path.hpp"
#include "project/metadata/Export.hpp"
#include "project/metadata/FileChangeRequestListener.hpp"
#include "project/metadata/MetadataNode.hpp"
#include "project/metadata/MetadataPath.hpp"

namespace project::metadata {

/// The metadata store of one project: a tree of addresses, at some of which a node is stored.
///
/// An address exists if it has a node, if an address below it exists, or if createPaths created it. Every
/// operation may be called with or without a guard; a guard that is held across several operations makes them
/// one step for other threads. Any operation may throw the store's own errors, for example when the disk
/// fails; a write that throws is rolled back.
class PROJECT_METADATA_EXPORT MetadataManager {
public:
    virtual ~MetadataManager();

    /// Blocks until this thread may read, and returns the guard. A thread may take it again; see
    /// cmlink::ReentrantReadWriteLock.
    virtual cmlink::ReentrantReadWriteLock::LockGuard acquireReadLock() = 0;

    /// Blocks until this thread alone may read and write, and returns the guard.
    /// @throws std::system_error (resource_deadlock_would_occur) if this thread holds only a read guard.
    virtual cmlink::ReentrantReadWriteLock::LockGuard acquireWriteLock() = 0;

    /// Returns the folder on disk that contains the store's own files, absolute.
    virtual Path getMetadataRoot() = 0;

    /// Returns a copy of the node at an address, which the caller owns; null if the address has no node.
    virtual std::unique_ptr<MetadataNode> getNode(MetadataPath const& path) = 0;

    /// Stores the nodes at their addresses in one batch. A stored node is replaced as a whole; nodes below it
    /// stay. Missing addresses above are created. The store owns the nodes afterwards. Takes the write lock.
    /// @throws std::invalid_argument for a null node or the root's address. Nothing is written then.
    virtual void setNodes(std::map<MetadataPath, std::shared_ptr<MetadataNode>>& nodes) = 0;

    /// Returns true if this address has a node.
    virtual bool hasNode(MetadataPath const& path) = 0;

    /// Returns the addresses one step below, with or without a node, sorted by type and then by location in
    /// code units. The list is empty if the address does not exist.
    virtual std::vector<MetadataPath> getChildNodes(MetadataPath const& path) = 0;

    /// Subscribes a listener as long as it lives. The store calls the listeners in the order in which they
    /// subscribed. Takes no lock of the store.
    virtual void subscribe(std::weak_ptr<FileChangeRequestListener> listener) = 0;

    /// Removes the addresses with everything below them in one batch. Addresses that do not exist are
    /// skipped. Takes the write lock.
    virtual void removeNodes(std::vector<MetadataPath>& paths) = 0;

    /// Creates the addresses without nodes, in one batch. An address that exists is not changed. A created
    /// address exists until it is removed. Takes the write lock.
    virtual void createPaths(std::vector<MetadataPath>& paths) = 0;

    /// Returns true if the address exists, with or without a node.
    virtual bool pathExists(MetadataPath path) = 0;
};

} // namespace project::metadata
