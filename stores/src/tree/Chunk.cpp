#include "tree/Chunk.hpp"

#include <algorithm>
#include <iterator>
#include <limits>
#include <stdexcept>
#include <utility>

#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

/// True for the plain node, and for every node that is equal to it.
bool isPlain(Node const& node) {
    auto const& plainOne = plainNode();
    return node == plainOne || (node && isEqual(*node, *plainOne));
}

/// Makes room for more elements. Grows by less than a standard container does, since most entries of a tree
/// are never followed by others.
template <typename Element>
void makeRoom(std::pmr::vector<Element>& elements, std::size_t more) {
    std::size_t const needed = elements.size() + more;
    if (needed > elements.capacity()) {
        elements.reserve(needed + needed / 4);
    }
}

} // namespace

Chunk::Found Chunk::find(ElementKey const& key) const noexcept {
    std::size_t low = 0;
    std::size_t high = size();
    while (low < high) {
        std::size_t const middle = low + (high - low) / 2;
        auto const order = compare(key, middle);
        if (std::is_eq(order)) {
            return {middle, true};
        }
        std::is_gt(order) ? low = middle + 1 : high = middle;
    }
    return {low, false};
}

Node const& Chunk::node(std::size_t index) const noexcept {
    static Node const none;
    if (has(index, plain)) {
        return plainNode();
    }
    return has(index, recorded) ? recordAt(index)->node : none;
}

LevelBelow* Chunk::below(std::size_t index) const noexcept {
    if (!has(index, recorded)) {
        return nullptr;
    }
    auto& below = recordAt(index)->below;
    return below.isNone() ? nullptr : &below;
}

LevelBelow& Chunk::makeBelow(std::size_t index) {
    return makeRecord(index).below;
}

void Chunk::setState(std::size_t index, Node node, bool isCreated) {
    bool const isNowPlain = isPlain(node);
    bool const isOwn = node && !isNowPlain;
    if (isOwn) {
        makeRecord(index).node = std::move(node);
    } else if (has(index, recorded)) {
        auto const record = recordAt(index);
        record->node.reset();
        if (record->below.isNone()) {
            records_.erase(record);
            entries_[index].bits &= ~recorded;
        }
    }
    auto& bits = entries_[index].bits;
    bits = (bits & ~(plain | created)) | (isNowPlain ? plain : 0U) | (isCreated ? created : 0U);
}

void Chunk::insert(std::size_t index, NewElement const& element, Place place) {
    std::size_t const length = element.name.size();
    if (length > std::numeric_limits<std::uint32_t>::max() - names_.size()) {
        throw std::length_error(errorTexts.get("LocationsTooLong"));
    }
    bool const isNowPlain = isPlain(place.node);
    bool const isRecorded = (place.node && !isNowPlain) || !place.below.isNone();
    makeRoom(names_, length);
    makeRoom(entries_, 1);
    makeRoom(records_, isRecorded ? 1 : 0);
    auto const from = begin(index);
    auto const at = names_.insert(names_.begin() + from, length, '\0');
    element.name.copyTo(std::to_address(at));
    auto const bits = (element.type << typeShift) | (isNowPlain ? plain : 0U) |
                      (place.isCreated ? created : 0U) | (element.name.isWide() ? wide : 0U) |
                      (isRecorded ? recorded : 0U);
    auto const entry =
        entries_.insert(std::next(entries_.begin(), static_cast<std::ptrdiff_t>(index)), Entry{from, bits});
    std::for_each(entry, entries_.end(),
                  [length](Entry& moved) { moved.end += static_cast<std::uint32_t>(length); });
    auto const record = recordAt(index);
    std::for_each(record, records_.end(), [](Record& moved) { ++moved.index; });
    if (isRecorded) {
        records_.insert(record,
                        {index, isNowPlain ? nullptr : std::move(place.node), std::move(place.below)});
    }
}

Place Chunk::extract(std::size_t index) noexcept {
    Place place{node(index), isCreated(index), {}};
    auto record = recordAt(index);
    if (has(index, recorded)) {
        place.below = std::move(record->below);
        record = records_.erase(record);
    }
    std::for_each(record, records_.end(), [](Record& moved) { --moved.index; });
    auto const from = begin(index);
    auto const length = entries_[index].end - from;
    names_.erase(names_.begin() + from, names_.begin() + from + length);
    auto const entry = entries_.erase(std::next(entries_.begin(), static_cast<std::ptrdiff_t>(index)));
    std::for_each(entry, entries_.end(), [length](Entry& moved) { moved.end -= length; });
    return place;
}

Chunk Chunk::splitAt(std::size_t index) {
    Chunk right(entries_.get_allocator().resource());
    auto const from = begin(index);
    auto const entry = std::next(entries_.begin(), static_cast<std::ptrdiff_t>(index));
    right.entries_.assign(entry, entries_.end());
    right.names_.assign(names_.begin() + from, names_.end());
    auto const record = recordAt(index);
    right.records_.reserve(static_cast<std::size_t>(records_.end() - record));
    std::move(record, records_.end(), std::back_inserter(right.records_));
    for (auto& moved : right.entries_) {
        moved.end -= from;
    }
    for (auto& moved : right.records_) {
        moved.index -= index;
    }
    entries_.erase(entry, entries_.end());
    names_.erase(names_.begin() + from, names_.end());
    records_.erase(record, records_.end());
    return right;
}

void Chunk::append(Chunk&& other) {
    makeRoom(entries_, other.entries_.size());
    makeRoom(names_, other.names_.size());
    makeRoom(records_, other.records_.size());
    auto const behind = static_cast<std::uint32_t>(names_.size());
    std::size_t const before = entries_.size();
    for (auto const& entry : other.entries_) {
        entries_.push_back({entry.end + behind, entry.bits});
    }
    names_.insert(names_.end(), other.names_.begin(), other.names_.end());
    for (auto& record : other.records_) {
        record.index += before;
        records_.push_back(std::move(record));
    }
    other.clear();
}

void Chunk::clear() noexcept {
    entries_.clear();
    names_.clear();
    records_.clear();
}

Chunk Chunk::takeTrimmed(std::pmr::memory_resource* memory) {
    Chunk taken(memory);
    taken.entries_ = entries_;
    taken.names_ = names_;
    taken.records_.reserve(records_.size());
    std::move(records_.begin(), records_.end(), std::back_inserter(taken.records_));
    clear();
    return taken;
}

std::pmr::vector<Chunk::Record>::const_iterator Chunk::recordAt(std::size_t index) const noexcept {
    // All entries before it have records, except for those without.
    auto const without = entries_.size() - records_.size();
    auto const from = static_cast<std::ptrdiff_t>(index - std::min(index, without));
    auto const to = static_cast<std::ptrdiff_t>(std::min(index, records_.size()));
    return std::partition_point(std::next(records_.begin(), from), std::next(records_.begin(), to),
                                [index](Record const& record) { return record.index < index; });
}

std::pmr::vector<Chunk::Record>::iterator Chunk::recordAt(std::size_t index) noexcept {
    auto const found = std::as_const(*this).recordAt(index);
    return records_.begin() + (found - records_.cbegin());
}

Chunk::Record& Chunk::makeRecord(std::size_t index) {
    auto record = recordAt(index);
    if (!has(index, recorded)) {
        record = records_.insert(record, {index, nullptr, {}});
        entries_[index].bits |= recorded;
    }
    return *record;
}

} // namespace project::stores
