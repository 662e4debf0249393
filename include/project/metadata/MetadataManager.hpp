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
/// An address exists when a node is stored there, when anything lies below it, or when createPaths made it.
/// Every operation may be called with or without a guard; a guard held across several makes them one step
/// for other threads. Any operation may throw what the store throws when its disk fails; the tree is then as
/// it was before.
class PROJECT_METADATA_EXPORT MetadataManager {
public:
    virtual ~MetadataManager();

    /// Blocks until this thread may read. Reentrant; see cmlink::ReentrantReadWriteLock.
    virtual cmlink::ReentrantReadWriteLock::LockGuard acquireReadLock() = 0;

    /// Blocks until this thread alone may read and write. A thread that holds only a read guard gets
    /// std::system_error instead.
    virtual cmlink::ReentrantReadWriteLock::LockGuard acquireWriteLock() = 0;

    /// The folder on disk in which the store keeps its own files, absolute.
    virtual Path getMetadataRoot() = 0;

    /// A fresh copy of the node at an address, which the caller owns; null when none is stored there.
    virtual std::unique_ptr<MetadataNode> getNode(MetadataPath const& path) = 0;

    /// Replaces the nodes at all the addresses in one batch, making the addresses and those above them that
    /// are missing. Nodes are replaced whole. Takes the write lock. The nodes belong to the store afterwards.
    /// @throws std::invalid_argument for a null node or the root's address, before anything is written.
    virtual void setNodes(std::map<MetadataPath, std::shared_ptr<MetadataNode>>& nodes) = 0;

    /// True when a node is stored at exactly this address.
    virtual bool hasNode(MetadataPath const& path) = 0;

    /// The addresses one level below, with a node or not, by type and then location, each by code units.
    /// Empty for an address that does not exist.
    virtual std::vector<MetadataPath> getChildNodes(MetadataPath const& path) = 0;

    /// Adds a listener for as long as it lives. One that has gone is passed over.
    virtual void subscribe(std::weak_ptr<FileChangeRequestListener> listener) = 0;

    /// Removes all the addresses with everything below them in one batch; those that do not exist are
    /// ignored. Takes the write lock.
    virtual void removeNodes(std::vector<MetadataPath>& paths) = 0;

    /// Makes each address exist without storing a node there. On one that exists it changes nothing. Takes
    /// the write lock.
    virtual void createPaths(std::vector<MetadataPath>& paths) = 0;

    /// True when the address exists, with a node or not.
    virtual bool pathExists(MetadataPath path) = 0;
};

} // namespace project::metadata
