#pragma once

#include <atomic>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <vector>

#include "project/stores/Change.hpp"

namespace project::stores {

/// The tree of addresses and nodes in memory, each level loaded when it is first asked for.
///
/// Queries may run in several threads at once: loading is guarded in here. Everything that changes the tree
/// needs it for itself alone. A query that finds its levels loaded costs a search in each of them.
class MetadataTree {
public:
    using Loader = std::function<Children(Address const&)>;

    /// How to undo what was applied; null when there is nothing to undo.
    struct UndoSteps;
    using Undo = std::shared_ptr<UndoSteps>;

    explicit MetadataTree(Loader loader);
    ~MetadataTree();

    /// The node at an address; null when none is stored there.
    Node node(Address const& address) const;

    /// True when a node is stored there, something lies below, or the address was made.
    bool exists(Address const& address) const;

    /// The addresses one level below, sorted by element.
    std::vector<Address> children(Address const& address) const;

    /// Applies the steps of a batch in order.
    /// Strongly safe: when it throws, nothing has changed.
    Undo apply(Batch const& batch);

    /// Brings back what was before. Nothing else may have been applied in between.
    void undo(Undo undo) noexcept;

    /// Loads again what others have changed, as far as it was loaded.
    void takeIn(Changes const& changes);

private:
    struct Place;
    struct ByElement;
    using Places = std::map<Address, Place, ByElement>;

    /// Loads the levels above as it goes. Null when the address does not exist.
    Place* find(Address const& address) const;
    /// Loads nothing. Null when the address does not exist, or what lies below it was never asked for.
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
