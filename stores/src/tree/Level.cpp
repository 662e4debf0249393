#include "tree/Level.hpp"

#include <algorithm>
#include <iterator>
#include <new>
#include <utility>

namespace project::stores {

std::size_t Level::size() const noexcept {
    std::size_t size = 0;
    for (auto const& chunk : chunks_) {
        size += chunk.size();
    }
    return size;
}

Level::Found Level::findNear(ElementKey const& key, Position hint) const noexcept {
    if (!isEntry(hint)) {
        return find(key);
    }
    if (isEqual(key, hint)) {
        return {hint, true};
    }
    // Before the order, which costs more: queries often proceed to the next entry.
    if (hasNext(hint) && isEqual(key, next(hint))) {
        return {next(hint), true};
    }
    auto const order = compare(key, hint);
    bool const isAfter = std::is_gt(order);
    bool const isOutmost = isAfter ? !hasNext(hint) : hint.chunk == 0 && hint.entry == 0;
    if (isOutmost) {
        return {isAfter ? Position{hint.chunk, hint.entry + 1} : hint, false};
    }
    auto const neighbour = isAfter ? next(hint) : previous(hint);
    auto const orderOfNeighbour = compare(key, neighbour);
    if (std::is_eq(orderOfNeighbour)) {
        return {neighbour, true};
    }
    if (std::is_gt(orderOfNeighbour) != isAfter) {
        // Between the two. Behind the last entry of a chunk is better than before the first of the next.
        return {isAfter ? Position{hint.chunk, hint.entry + 1}
                        : Position{neighbour.chunk, neighbour.entry + 1},
                false};
    }
    return find(key);
}

Level::Found Level::find(ElementKey const& key) const noexcept {
    if (chunks_.empty()) {
        return {{0, 0}, false};
    }
    // An element before all entries belongs to the first chunk too.
    auto const behind =
        std::partition_point(std::next(chunks_.begin()), chunks_.end(), [&key](Chunk const& candidate) {
            return std::is_gteq(candidate.compare(key, 0));
        });
    auto const chunk = std::prev(behind);
    auto const found = chunk->find(key);
    return {{static_cast<std::size_t>(chunk - chunks_.begin()), found.index}, found.isFound};
}

metadata::PathElement Level::element(TypeTable const& types, Position at) const {
    auto const& chunk = chunks_[at.chunk];
    return {types[chunk.type(at.entry)], chunk.name(at.entry).text()};
}

Level::Position Level::insert(Position at, NewElement const& element, Place place) {
    if (chunks_.empty()) {
        Chunk chunk(memory());
        chunk.insert(0, element, std::move(place));
        chunks_.push_back(std::move(chunk));
        return {0, 0};
    }
    if (chunks_[at.chunk].size() == Chunk::mostEntries) {
        at = split(at);
    }
    chunks_[at.chunk].insert(at.entry, element, std::move(place));
    return at;
}

/// Splits a full chunk. @return where the position is now.
///
/// At the end of the level, the new chunk begins with the last entry: so a level that grows at its end has
/// full chunks.
Level::Position Level::split(Position at) {
    bool const isAtEnd = at.chunk + 1 == chunks_.size() && at.entry == Chunk::mostEntries;
    std::size_t const half = isAtEnd ? Chunk::mostEntries - 1 : Chunk::mostEntries / 2;
    if (chunks_.size() == chunks_.capacity()) {
        chunks_.reserve(2 * chunks_.size());
    }
    auto right = chunks_[at.chunk].splitAt(half);
    chunks_.insert(std::next(chunks_.begin(), static_cast<std::ptrdiff_t>(at.chunk) + 1), std::move(right));
    return at.entry <= half ? at : Position{at.chunk + 1, at.entry - half};
}

Place Level::extract(Position at) noexcept {
    auto place = chunks_[at.chunk].extract(at.entry);
    if (chunks_[at.chunk].empty()) {
        chunks_.erase(std::next(chunks_.begin(), static_cast<std::ptrdiff_t>(at.chunk)));
    } else {
        mergeIfSmall(at.chunk);
    }
    return place;
}

/// Merges a chunk with the one behind it if both together are half full at most.
void Level::mergeIfSmall(std::size_t chunk) noexcept {
    constexpr std::size_t few = Chunk::mostEntries / 4;
    bool const isSmall = chunks_[chunk].size() < few;
    std::size_t const left = isSmall && chunk + 1 == chunks_.size() && chunk > 0 ? chunk - 1 : chunk;
    if (!isSmall || left + 1 >= chunks_.size() ||
        chunks_[left].size() + chunks_[left + 1].size() > Chunk::mostEntries / 2) {
        return;
    }
    try {
        chunks_[left].append(std::move(chunks_[left + 1]));
        chunks_.erase(std::next(chunks_.begin(), static_cast<std::ptrdiff_t>(left) + 1));
    } catch (std::bad_alloc const&) {
        // Two small chunks only take more memory than one.
    }
}

} // namespace project::stores
