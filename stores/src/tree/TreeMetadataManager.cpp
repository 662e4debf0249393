#include "project/stores/TreeMetadataManager.hpp"

#include <set>
#include <stdexcept>
#include <utility>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"
#include "tree/ChangeLog.hpp"
#include "tree/ListenerList.hpp"
#include "tree/MetadataTree.hpp"
#include "tree/WriteLog.hpp"

namespace project::stores {

using cmlink::ReentrantReadWriteLock;
using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;

namespace {

/// A copy of the caller's node, so that later changes of that node do not change the store.
Node copyOf(MetadataNode const& node) {
    return isEqual(node, *plainNode()) ? plainNode()
                                       : std::make_shared<MetadataNodeSpecification const>(node);
}

/// Marks the time in which a batch is committed.
class CommittingMark {
public:
    explicit CommittingMark(bool& mark) : mark_(mark) { mark_ = true; }

    ~CommittingMark() { mark_ = false; }

    CommittingMark(CommittingMark const&) = delete;
    CommittingMark& operator=(CommittingMark const&) = delete;

private:
    bool& mark_;
};

} // namespace

class TreeMetadataManager::State {
public:
    State(std::unique_ptr<Backend> storage, Path root)
        : backend(std::move(storage)),
          metadataRoot(std::move(root)),
          tree([this](Address const& address, ChildSink& children) { backend->load(address, children); }),
          log(tree),
          lock({[this](Access access) { enter(access); }, [this] { backend->leave(); }}) {}

    /// Applies a batch to the tree. Commits it, unless a transaction is open.
    void write(MetadataManager& store, Batch batch, ListenerList::Always always);

    /// Writes all batches of the log to the backend as one, notifies the listeners, and commits it. If that
    /// fails, everything is undone.
    void commit(MetadataManager& store);

    /// @throws StoreError if a listener writes while it is notified of a write.
    void requireNotCommitting() const;

    std::unique_ptr<Backend> const backend;
    Path const metadataRoot;
    MetadataTree tree;
    WriteLog log;
    ChangeLog othersChanges;
    ListenerList listeners;
    bool committing = false;
    ReentrantReadWriteLock lock; // last, since it enters and leaves the backend

private:
    void enter(Access access);
};

void TreeMetadataManager::State::enter(Access access) {
    auto const changes = backend->enter(access);
    try {
        othersChanges.add(changes);
        tree.applyChanges(changes);
    } catch (...) {
        tree.applyChanges({true, {}}); // discards the half-applied changes; the levels are loaded on request
        backend->leave();
        throw;
    }
}

void TreeMetadataManager::State::requireNotCommitting() const {
    if (committing) {
        throw StoreError(StoreError::Kind::Refused, fl::filesystem::toSystem(metadataRoot).string(), 0,
                         errorTexts.get("ListenerWrote"), errorTexts.get("RemedyOfListener"));
    }
}

void TreeMetadataManager::State::write(MetadataManager& store, Batch batch, ListenerList::Always always) {
    log.apply(std::move(batch), always);
    if (!log.isInTransaction()) {
        commit(store);
    }
}

void TreeMetadataManager::State::commit(MetadataManager& store) {
    CommittingMark const mark(committing);
    ListenerList::Notification notification(listeners, store, metadataRoot);
    Batch batch;
    try {
        batch = log.takeBatch();
        auto files = batch.empty() ? FileChanges() : backend->write(batch);
        notification.notify(std::move(files), log.always());
        if (!batch.empty()) {
            backend->keep();
        }
        log.clear();
    } catch (...) {
        if (!batch.empty()) {
            backend->discard();
        }
        log.undoAll();
        notification.notifyOfReverse();
        throw;
    }
}

TreeMetadataManager::TreeMetadataManager(std::unique_ptr<Backend> backend, Path metadataRoot)
    : state_(std::make_unique<State>(std::move(backend), std::move(metadataRoot))) {
}

TreeMetadataManager::~TreeMetadataManager() = default;

ReentrantReadWriteLock::LockGuard TreeMetadataManager::acquireReadLock() {
    return state_->lock.readLock();
}

ReentrantReadWriteLock::LockGuard TreeMetadataManager::acquireWriteLock() {
    return state_->lock.writeLock();
}

Path TreeMetadataManager::getMetadataRoot() {
    return state_->metadataRoot;
}

std::unique_ptr<MetadataNode> TreeMetadataManager::getNode(Address const& path) {
    auto const guard = state_->lock.readLock();
    auto const node = state_->tree.node(path);
    return node ? std::make_unique<MetadataNodeSpecification>(*node) : nullptr;
}

void TreeMetadataManager::setNodes(std::map<Address, std::shared_ptr<MetadataNode>>& nodes) {
    auto const guard = state_->lock.writeLock();
    state_->requireNotCommitting();
    Batch batch;
    batch.reserve(nodes.size());
    MetadataTree::Search search(state_->tree);
    for (auto const& [address, node] : nodes) {
        if (!node || address.depth() == 0) {
            throw std::invalid_argument(errorTexts.get(node ? "NodeAtRoot" : "NodeIsNull"));
        }
        auto const& before = search.node(address);
        if (!before || !isEqual(*before, *node)) {
            batch.push_back({Change::Kind::Set, address, copyOf(*node)});
        }
    }
    state_->write(*this, std::move(batch), {.addition = true});
}

bool TreeMetadataManager::hasNode(Address const& path) {
    auto const guard = state_->lock.readLock();
    return state_->tree.hasNode(path);
}

std::vector<Address> TreeMetadataManager::getChildNodes(Address const& path) {
    auto const guard = state_->lock.readLock();
    return state_->tree.children(path);
}

void TreeMetadataManager::loadChildren(Address const& path, ChildSink& children) {
    auto const guard = state_->lock.readLock();
    state_->tree.passChildren(path, children);
}

void TreeMetadataManager::subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) {
    state_->listeners.add(std::move(listener));
}

void TreeMetadataManager::removeNodes(std::vector<Address>& paths) {
    auto const guard = state_->lock.writeLock();
    state_->requireNotCommitting();
    std::set<Address> all;
    for (auto const& path : paths) {
        if (path.depth() == 0) {
            auto const top = state_->tree.children(path);
            all.insert(top.begin(), top.end());
        } else if (state_->tree.exists(path)) {
            all.insert(path);
        }
    }
    Batch batch;
    for (auto const& address : all) {
        if (batch.empty() ||
            !address.isWithin(batch.back().address)) { // otherwise it is deleted with the address above
            batch.push_back({Change::Kind::Remove, address, nullptr});
        }
    }
    state_->write(*this, std::move(batch), {.removal = true});
}

void TreeMetadataManager::createPaths(std::vector<Address>& paths) {
    auto const guard = state_->lock.writeLock();
    state_->requireNotCommitting();
    // Sorted, so that each address is created before those below it. Otherwise it would exist by then,
    // because of them alone, and would be deleted with them.
    std::set<Address> absent;
    for (auto const& path : paths) {
        if (!state_->tree.exists(path)) {
            absent.insert(path);
        }
    }
    absent.erase(Address::root());
    Batch batch;
    for (auto const& address : absent) {
        batch.push_back({Change::Kind::Create, address, nullptr});
    }
    state_->write(*this, std::move(batch), {});
}

bool TreeMetadataManager::pathExists(Address path) {
    auto const guard = state_->lock.readLock();
    return state_->tree.exists(path);
}

Transaction TreeMetadataManager::transaction() {
    auto guard = state_->lock.writeLock();
    state_->requireNotCommitting();
    return Transaction(*this, std::move(guard), state_->log.begin());
}

bool TreeMetadataManager::isOpen(std::uint64_t transaction) const noexcept {
    return state_->log.isOpen(transaction);
}

bool TreeMetadataManager::isInnermost(std::uint64_t transaction) const noexcept {
    return state_->log.isInnermost(transaction);
}

void TreeMetadataManager::commitInnermost() {
    state_->log.end();
    if (!state_->log.isInTransaction()) {
        state_->commit(*this);
    }
}

void TreeMetadataManager::rollBack(std::uint64_t transaction) noexcept {
    state_->log.rollBack(transaction);
}

Changes TreeMetadataManager::takeOthersChanges() {
    auto const guard = state_->lock.readLock();
    return state_->othersChanges.take();
}

} // namespace project::stores
