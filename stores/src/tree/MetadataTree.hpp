#pragma once

#include <atomic>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <vector>

#include "project/stores/Change.hpp"

namespace project::stores {

/// The tree of addresses and nodes in memory, each level loaded on the first request.
///
/// Queries may run in several threads at once: loading is synchronised here. An operation that changes the
/// tree must not run at the same time as any other one. A query costs one search in each level that is
/// loaded.
class MetadataTree {
public:
    using Loader = std::function<Children(Address const&)>;

    /// The steps that undo a batch; null if there is nothing to undo.
    struct UndoSteps;
    using Undo = std::shared_ptr<UndoSteps>;

    explicit MetadataTree(Loader loader);
    ~MetadataTree();

    /// The node at an address; null if none is stored there.
    Node node(Address const& address) const;

    /// True if a node is stored there, something is stored below it, or the address was created.
    bool exists(Address const& address) const;

    /// The addresses one level below, sorted by element.
    std::vector<Address> children(Address const& address) const;

    /// Applies the steps of a batch in order. If it throws, nothing has changed.
    Undo apply(Batch const& batch);

    /// Restores the state before a batch. No other batch may have been applied since.
    void undo(Undo undo) noexcept;

    /// Reloads the levels that others have changed, as far as they were loaded.
    void applyChanges(Changes const& changes);

private:
    struct Place;
    struct ByElement;
    using Places = std::map<Address, Place, ByElement>;

    /// Loads the levels above. Null if the address does not exist.
    Place* find(Address const& address) const;
    /// Loads nothing. Null if the address does not exist or its children were never requested.
    Place* findLoaded(Address const& address) const;
    void load(Place& place, Address const& address) const;
    void reload(Place& place, Address const& address);
    void forget();
    void set(Change const& change, UndoSteps& undo);
    void remove(Address const& address, UndoSteps& undo);

    Loader loader_;
    std::unique_ptr<Place> root_;
    mutable std::mutex loading_;
};

} // namespace project::stores
