#pragma once

#include <cstddef>
#include <memory_resource>
#include <utility>
#include <vector>

#include "project/stores/Node.hpp"
#include "tree/Chunk.hpp"
#include "tree/ElementKey.hpp"
#include "tree/LevelBelow.hpp"

namespace project::stores {

/// The addresses directly below one address: entries sorted by element, in chunks.
///
/// A search costs one comparison for each doubling of the level, or one or two if it finds its element next
/// to the hint. Inserting and extracting cost one chunk. Positions are valid until an entry is inserted or
/// extracted; the level itself does not move.
class Level {
public:
    struct Position {
        std::size_t chunk = 0;
        std::size_t entry = 0;

        friend bool operator==(Position const&, Position const&) = default;
    };

    /// The position of an element, or the one at which it would be inserted.
    struct Found {
        Position position;
        bool isFound;
    };

    explicit Level(std::pmr::memory_resource* memory) : chunks_(memory) {}

    /// Creates a level in some memory, which must outlive it.
    static LevelPointer create(std::pmr::memory_resource* memory) {
        return LevelPointer(std::pmr::polymorphic_allocator<Level>(memory).new_object<Level>(memory));
    }

    std::pmr::memory_resource* memory() const noexcept { return chunks_.get_allocator().resource(); }

    bool empty() const noexcept { return chunks_.empty(); }

    bool hasOneEntry() const noexcept { return chunks_.size() == 1 && chunks_.front().size() == 1; }

    std::size_t size() const noexcept;

    Found find(ElementKey const& key) const noexcept;

    /// @param hint where the element is likely to be, or next to it; any position.
    Found findNear(ElementKey const& key, Position hint) const noexcept;

    /// Calls a function with each position, in order.
    template <typename Function>
    void forEach(Function const& function) const {
        for (Position at; at.chunk < chunks_.size(); ++at.chunk) {
            for (at.entry = 0; at.entry < chunks_[at.chunk].size(); ++at.entry) {
                function(at);
            }
        }
    }

    metadata::PathElement element(TypeTable const& types, Position at) const;

    Node const& node(Position at) const noexcept { return chunks_[at.chunk].node(at.entry); }

    bool isCreated(Position at) const noexcept { return chunks_[at.chunk].isCreated(at.entry); }

    /// The level below an entry; null if there is none.
    LevelBelow* below(Position at) const noexcept { return chunks_[at.chunk].below(at.entry); }

    LevelBelow& makeBelow(Position at) { return chunks_[at.chunk].makeBelow(at.entry); }

    void setState(Position at, Node node, bool isCreated) {
        chunks_[at.chunk].setState(at.entry, std::move(node), isCreated);
    }

    /// Inserts an entry at the position that find returned. @return its position now.
    Position insert(Position at, NewElement const& element, Place place);

    /// Removes an entry.
    Place extract(Position at) noexcept;

    /// Appends a chunk, whose entries must come after those of the level.
    void append(Chunk chunk) { chunks_.push_back(std::move(chunk)); }

    /// Releases unused memory, but not that of the chunks.
    void trim() { chunks_.shrink_to_fit(); }

private:
    bool isEqual(ElementKey const& key, Position at) const noexcept {
        auto const& chunk = chunks_[at.chunk];
        return key.isEqual(chunk.type(at.entry), chunk.name(at.entry));
    }

    std::strong_ordering compare(ElementKey const& key, Position at) const noexcept {
        return chunks_[at.chunk].compare(key, at.entry);
    }

    bool isEntry(Position at) const noexcept {
        return at.chunk < chunks_.size() && at.entry < chunks_[at.chunk].size();
    }

    bool hasNext(Position at) const noexcept {
        return at.entry + 1 < chunks_[at.chunk].size() || at.chunk + 1 < chunks_.size();
    }

    Position next(Position at) const noexcept {
        return at.entry + 1 < chunks_[at.chunk].size() ? Position{at.chunk, at.entry + 1}
                                                       : Position{at.chunk + 1, 0};
    }

    Position previous(Position at) const noexcept {
        return at.entry > 0 ? Position{at.chunk, at.entry - 1}
                            : Position{at.chunk - 1, chunks_[at.chunk - 1].size() - 1};
    }

    Position split(Position at);
    void mergeIfSmall(std::size_t chunk) noexcept;

    std::pmr::vector<Chunk> chunks_; ///< none is empty
};

} // namespace project::stores
