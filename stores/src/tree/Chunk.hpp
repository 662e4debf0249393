#pragma once

#include <compare>
#include <cstddef>
#include <cstdint>
#include <memory_resource>
#include <vector>

#include "project/stores/Node.hpp"
#include "tree/ElementKey.hpp"
#include "tree/LevelBelow.hpp"
#include "tree/StoredName.hpp"
#include "tree/TypeTable.hpp"

namespace project::stores {

/// The value of an entry: the state of its address, and the level below it.
struct Place {
    Node node;
    bool isCreated = false;
    LevelBelow below;
};

/// The element of an entry that is inserted.
struct NewElement {
    TypeTable::Index type;
    NewName name;
};

/// Some consecutive entries of a level, sorted by element.
///
/// An entry takes eight bytes and its name. Only an entry with a node of its own, which is not the plain one,
/// or with something below it has a record, of 40 bytes. Inserting and extracting cost one move of the
/// entries and names behind; every other operation costs at most one search among the records.
class Chunk {
public:
    /// A level splits a chunk that would become larger. With more entries, single changes would become
    /// slower; with fewer, the chunks themselves would take more memory.
    static constexpr std::size_t mostEntries = 128;

    explicit Chunk(std::pmr::memory_resource* memory) : entries_(memory), names_(memory), records_(memory) {}

    std::size_t size() const noexcept { return entries_.size(); }

    bool empty() const noexcept { return entries_.empty(); }

    TypeTable::Index type(std::size_t index) const noexcept { return entries_[index].bits >> typeShift; }

    StoredName name(std::size_t index) const noexcept {
        auto const from = begin(index);
        return {{names_.data() + from, entries_[index].end - from}, has(index, wide)};
    }

    /// The order of an element and an entry.
    std::strong_ordering compare(ElementKey const& key, std::size_t index) const noexcept {
        return key.compareWith(type(index), name(index));
    }

    /// The index of an element, or the one at which it would be inserted.
    struct Found {
        std::size_t index;
        bool isFound;
    };

    Found find(ElementKey const& key) const noexcept;

    Node const& node(std::size_t index) const noexcept;

    bool isCreated(std::size_t index) const noexcept { return has(index, created); }

    /// The level below an entry; null if there is none.
    LevelBelow* below(std::size_t index) const noexcept;

    /// The same; creates the record that contains it.
    LevelBelow& makeBelow(std::size_t index);

    void setState(std::size_t index, Node node, bool isCreated);

    /// Inserts an entry before another one, or at the end. If it throws, nothing has changed.
    void insert(std::size_t index, NewElement const& element, Place place);

    /// Removes an entry.
    Place extract(std::size_t index) noexcept;

    /// Moves the entries from an index on to a new chunk.
    Chunk splitAt(std::size_t index);

    /// Appends all entries of another chunk, which must come after those of this one.
    void append(Chunk&& other);

    void clear() noexcept;

    /// Moves the entries to a chunk without unused memory, and keeps the memory of this one for new entries.
    Chunk takeTrimmed(std::pmr::memory_resource* memory);

private:
    enum : std::uint32_t { plain = 1, created = 2, wide = 4, recorded = 8, typeShift = 4 };

    struct Entry {
        std::uint32_t end;  ///< of its name
        std::uint32_t bits; ///< flags, and the type
    };

    struct Record {
        std::size_t index; ///< of the entry
        Node node;
        mutable LevelBelow below; ///< loaded by readers
    };

    bool has(std::size_t index, std::uint32_t flag) const noexcept {
        return (entries_[index].bits & flag) != 0;
    }

    std::uint32_t begin(std::size_t index) const noexcept { return index == 0 ? 0 : entries_[index - 1].end; }

    /// The record of an entry, or the place where it would be.
    std::pmr::vector<Record>::iterator recordAt(std::size_t index) noexcept;
    std::pmr::vector<Record>::const_iterator recordAt(std::size_t index) const noexcept;
    Record& makeRecord(std::size_t index);

    std::pmr::vector<Entry> entries_;
    std::pmr::vector<char> names_;
    std::pmr::vector<Record> records_; ///< sorted by index
};

} // namespace project::stores
