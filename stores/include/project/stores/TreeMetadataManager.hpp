#pragma once

#include <functional>
#include <memory>
#include <vector>

#include "project/metadata/MetadataManager.hpp"
#include "project/stores/Backend.hpp"

namespace project::stores {

/// The metadata store of the library: a tree in memory, loaded level by level from a backend as it is asked
/// for, and written through to it.
///
/// A write goes in this order: nodes equal to what is stored are left out; the backend writes; the tree
/// changes; the listeners are told; the backend keeps. When anything of it throws, the backend discards, the
/// tree is as it was, listeners already told are told of the reverse, and the exception goes on.
class PROJECT_STORES_EXPORT TreeMetadataManager : public metadata::MetadataManager {
public:
    /// @param metadataRoot the folder in which the backend keeps its files, absolute; nothing is read here.
    TreeMetadataManager(std::unique_ptr<Backend> backend, Path metadataRoot);
    ~TreeMetadataManager() override;

    cmlink::ReentrantReadWriteLock::LockGuard acquireReadLock() override;
    cmlink::ReentrantReadWriteLock::LockGuard acquireWriteLock() override;
    Path getMetadataRoot() override;
    std::unique_ptr<metadata::MetadataNode> getNode(metadata::MetadataPath const& path) override;
    void setNodes(std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>>& nodes) override;
    bool hasNode(metadata::MetadataPath const& path) override;
    std::vector<metadata::MetadataPath> getChildNodes(metadata::MetadataPath const& path) override;
    void subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) override;
    void removeNodes(std::vector<metadata::MetadataPath>& paths) override;
    void createPaths(std::vector<metadata::MetadataPath>& paths) override;
    bool pathExists(metadata::MetadataPath path) override;

    /// What others have changed in the store since the last call, or for the first call since the first
    /// guard: one difference for each address, sorted, from before the first change of it to after the last.
    /// What came back to what it was is left out.
    ///
    /// Takes the read lock, and so looks for changes unless a guard is open. Between two calls each address
    /// that others have changed is kept, with both nodes.
    Changes takeOthersChanges();

private:
    class State;

    std::unique_ptr<State> state_;
};

} // namespace project::stores
