#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "project/metadata/MetadataManager.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/MemoryBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::test {

/// Builds an address from pairs of type and location: address({{u"Files", u"Root"}, {u"File", u"a"}}).
inline metadata::MetadataPath address(std::vector<metadata::PathElement> elements) {
    return metadata::MetadataPath(std::move(elements));
}

/// One call of the store, as a manager made it.
struct StoreCall {
    enum class Guard { None, Read, Write };

    std::string operation;                     ///< "setNodes", "getNode", "acquireReadLock", ...
    std::vector<metadata::MetadataPath> paths; ///< the addresses, in the order of the arguments
    Guard guard;                               ///< the guard that was held during the call
};

/// A store in memory that records every call, and the guard that is held during it.
///
/// The guard is the outermost one that was taken through this object. Only one thread may use it. Calls that
/// acquire a guard are recorded too, with the guard that was held before.
class RecordingMetadataManager : public metadata::MetadataManager {
public:
    explicit RecordingMetadataManager(metadata::Path metadataRoot = u"/project/.projectdata")
        : store_(std::make_unique<stores::MemoryBackend>(), std::move(metadataRoot)),
          lock_({[this](auto access) { taken(access); }, [this] { held_ = StoreCall::Guard::None; }}) {}

    /// All calls since the last clear.
    std::vector<StoreCall> const& calls() const { return calls_; }

    /// The calls of one operation since the last clear.
    std::vector<StoreCall> calls(std::string const& operation) const {
        std::vector<StoreCall> result;
        for (auto const& call : calls_) {
            if (call.operation == operation) {
                result.push_back(call);
            }
        }
        return result;
    }

    /// The names of the operations since the last clear, without those that acquire a guard.
    std::vector<std::string> operations() const {
        std::vector<std::string> result;
        for (auto const& call : calls_) {
            if (!call.operation.starts_with("acquire")) {
                result.push_back(call.operation);
            }
        }
        return result;
    }

    /// The calls that change the store: setNodes, removeNodes, createPaths.
    std::vector<std::string> writes() const {
        auto result = operations();
        std::erase_if(result, [](auto const& name) {
            return name != "setNodes" && name != "removeNodes" && name != "createPaths";
        });
        return result;
    }

    void clear() { calls_.clear(); }

    /// From now on, the named operation calls `error`, which throws, before it does anything.
    void failOn(std::string operation, std::function<void()> error) {
        failing_ = std::move(operation);
        error_ = std::move(error);
    }

    /// The store itself, for changes and checks that are not recorded.
    metadata::MetadataManager& content() { return store_; }

    /// Stores one node. The call is not recorded.
    void put(metadata::MetadataPath const& path, std::map<std::u16string, std::u16string> const& values,
             std::u16string type = u"Info") {
        auto node = std::make_shared<metadata::MetadataNodeSpecification>(std::move(type));
        for (auto const& [key, value] : values) {
            node->put(key, value);
        }
        std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>> batch{{path, node}};
        store_.setNodes(batch);
    }

    bool isEmpty() { return store_.getChildNodes(metadata::MetadataPath::root()).empty(); }

    cmlink::ReentrantReadWriteLock::LockGuard acquireReadLock() override {
        record("acquireReadLock", {});
        return lock_.readLock();
    }

    cmlink::ReentrantReadWriteLock::LockGuard acquireWriteLock() override {
        record("acquireWriteLock", {});
        return lock_.writeLock();
    }

    metadata::Path getMetadataRoot() override {
        record("getMetadataRoot", {});
        return store_.getMetadataRoot();
    }

    std::unique_ptr<metadata::MetadataNode> getNode(metadata::MetadataPath const& path) override {
        record("getNode", {path});
        return store_.getNode(path);
    }

    void setNodes(std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>>& nodes) override {
        std::vector<metadata::MetadataPath> paths;
        for (auto const& [path, node] : nodes) {
            paths.push_back(path);
        }
        record("setNodes", std::move(paths));
        store_.setNodes(nodes);
    }

    bool hasNode(metadata::MetadataPath const& path) override {
        record("hasNode", {path});
        return store_.hasNode(path);
    }

    std::vector<metadata::MetadataPath> getChildNodes(metadata::MetadataPath const& path) override {
        record("getChildNodes", {path});
        return store_.getChildNodes(path);
    }

    void subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) override {
        record("subscribe", {});
        store_.subscribe(std::move(listener));
    }

    void removeNodes(std::vector<metadata::MetadataPath>& paths) override {
        record("removeNodes", paths);
        store_.removeNodes(paths);
    }

    void createPaths(std::vector<metadata::MetadataPath>& paths) override {
        record("createPaths", paths);
        store_.createPaths(paths);
    }

    bool pathExists(metadata::MetadataPath path) override {
        record("pathExists", {path});
        return store_.pathExists(std::move(path));
    }

private:
    using Access = cmlink::ReentrantReadWriteLock::Access;

    void taken(Access access) {
        held_ = access == Access::Write ? StoreCall::Guard::Write : StoreCall::Guard::Read;
    }

    void record(std::string operation, std::vector<metadata::MetadataPath> paths) {
        bool const fails = operation == failing_;
        calls_.push_back({std::move(operation), std::move(paths), held_});
        if (fails) {
            error_();
        }
    }

    stores::TreeMetadataManager store_;
    StoreCall::Guard held_ = StoreCall::Guard::None;
    cmlink::ReentrantReadWriteLock lock_;
    std::vector<StoreCall> calls_;
    std::string failing_;
    std::function<void()> error_;
};

} // namespace project::test
