#include "tree/TypeTable.hpp"

#include <bit>
#include <stdexcept>

namespace project::stores {

namespace {

struct Position {
    std::size_t segment;
    std::size_t offset;
};

Position positionOf(TypeTable::Index index) noexcept {
    std::size_t const number = std::size_t{index} + 1;
    auto const segment = static_cast<std::size_t>(std::bit_width(number)) - 1;
    return {segment, number - (std::size_t{1} << segment)};
}

} // namespace

TypeTable::Index TypeTable::index(std::u16string_view type) {
    if (auto const found = indexes_.find(type); found != indexes_.end()) {
        return found->second;
    }
    auto const index = static_cast<Index>(indexes_.size());
    auto const [segment, offset] = positionOf(index);
    if (segment == segmentCount) {
        throw std::length_error("the metadata tree has too many types");
    }
    auto& types = segments_[segment];
    if (!types) {
        types = std::make_unique<std::u16string[]>(std::size_t{1} << segment);
    }
    types[offset] = type;
    indexes_.emplace(types[offset], index);
    return index;
}

std::u16string const& TypeTable::operator[](Index index) const noexcept {
    auto const [segment, offset] = positionOf(index);
    return segments_[segment][offset];
}

} // namespace project::stores
