#pragma once

#include <functional>
#include <memory>
#include <memory_resource>
#include <mutex>
#include <vector>

#include "project/stores/Change.hpp"
#include "tree/Cursor.hpp"
#include "tree/Cursors.hpp"
#include "tree/LevelBelow.hpp"
#include "tree/LevelBuilder.hpp"
#include "tree/PageMemory.hpp"
#include "tree/TypeTable.hpp"

namespace project::stores {

/// The tree of addresses and nodes in memory, each level loaded on the first request.
///
/// Queries may run in several threads at once: loading is synchronised here. An operation that changes the
/// tree must not run at the same time as any other one.
///
/// A query begins where the previous query of its thread ended: at the last step that both addresses have in
/// common. Each further step costs one or two comparisons if its element is next to that of the previous
/// query in the same level, otherwise one comparison for each doubling of the level. A query for a loaded
/// address allocates no memory, except for its results. A change costs the same, and one move within a chunk
/// of at most 128 entries; it does not depend on the size of the level.
///
/// An address with the plain node, or without a node, takes eight bytes and its location: one byte for each
/// code unit if all are below 256, otherwise two. It has no object and no allocation of its own. A node of
/// its own or a level below costs 40 bytes more, and a level with its chunk some 150. Addresses are created
/// for results only.
class MetadataTree {
public:
    /// Passes the children of an address, sorted, to the sink.
    using Loader = std::function<void(Address const&, ChildSink&)>;

    /// The steps that undo a batch; null if there is nothing to undo.
    struct UndoSteps;
    using Undo = std::shared_ptr<UndoSteps>;

    /// Queries for many addresses, which must all exist until the last query. Each search begins at the last
    /// step that an address shares with the previous one. The tree must not change in the meantime.
    class Search {
    public:
        explicit Search(MetadataTree const& tree) : tree_(tree) {}

        /// The node at an address; null if none is stored there.
        Node const& node(Address const& address);

    private:
        MetadataTree const& tree_;
        Cursor cursor_;
    };

    explicit MetadataTree(Loader loader);
    ~MetadataTree();
    MetadataTree(MetadataTree const&) = delete;
    MetadataTree& operator=(MetadataTree const&) = delete;

    /// The node at an address; null if none is stored there.
    Node node(Address const& address) const;

    /// True if a node is stored there.
    bool hasNode(Address const& address) const;

    /// True if a node is stored there, something is stored below it, or the address was created.
    bool exists(Address const& address) const;

    /// The addresses one level below, sorted by element.
    std::vector<Address> children(Address const& address) const;

    /// Passes on the addresses one level below, sorted. A level that is not in memory comes from the loader
    /// and is not kept. The sink must not query the tree.
    void passChildren(Address const& address, ChildSink& children) const;

    /// Applies the steps of a batch in order. If it throws, nothing has changed.
    Undo apply(Batch const& batch);

    /// Restores the state before a batch. Batches are undone from the last to the first. Levels may have been
    /// loaded since.
    void undo(Undo undo) noexcept;

    /// Reloads the levels that others have changed, as far as they were loaded.
    void applyChanges(Changes const& changes);

private:
    enum class Loading { OnRequest, Never };

    /// Moves a cursor to an address, or to the last step above it that exists. @return true if it exists.
    bool moveTo(Address const& address, Cursor& cursor, Loading loading = Loading::OnRequest) const;

    /// Moves a cursor from a step on the way to its address.
    bool descend(Address const& address, Cursor& cursor, Loading loading = Loading::OnRequest) const;
    static Node const& nodeAt(Cursor const& cursor) noexcept;

    /// The level below the last step of a cursor, which is on the way to an address. Null if there is none.
    Level* levelBelow(Cursor const& cursor, Address const& address, Loading loading) const;
    LevelBelow* below(Cursor const& cursor) const noexcept;
    void load(LevelBelow& below, Address const& address) const;
    void pass(Level const& level, ChildSink& children) const;
    LevelPointer loadLevel(Address const& address) const;
    void reload(LevelBelow& below, Address const& address);
    void forget() noexcept;
    void set(Change const& change, Cursor& cursor, UndoSteps& undo);
    void remove(Address const& address, Cursor& cursor, UndoSteps& undo);
    void insertBelow(Cursor& cursor, Place place);
    void extract(Cursor& cursor, std::size_t depth, Place& place) noexcept;

    Loader loader_;
    mutable TypeTable types_; ///< a load may add types

    /// The memory of the levels, changed by loads. In the heap, they would lie between results, which live
    /// shorter, and most of the pages of deleted results would stay in use.
    PageMemory pages_;
    mutable std::pmr::unsynchronized_pool_resource memory_{&pages_};
    mutable LevelBelow root_ = LevelBelow::unloaded();
    mutable std::mutex loading_;
    mutable LevelBuilder builder_{types_, &memory_}; ///< guarded by loading_
    mutable Cursors cursors_;
};

} // namespace project::stores
