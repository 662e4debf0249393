#include "tree/TypeTable.hpp"

#include <bit>
#include <stdexcept>

#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

struct Position {
    std::size_t segment;
    std::size_t size; ///< of the segment
    std::size_t offset;
};

Position positionOf(TypeTable::Index index) noexcept {
    std::size_t const number = std::size_t{index} + 1;
    std::size_t const size = std::bit_floor(number);
    return {static_cast<std::size_t>(std::countr_zero(size)), size, number - size};
}

} // namespace

TypeTable::Index TypeTable::index(std::u16string_view type) {
    if (!indexes_.empty() && (*this)[last_] == type) {
        return last_;
    }
    if (auto const found = indexes_.find(type); found != indexes_.end()) {
        return last_ = found->second;
    }
    auto const index = static_cast<Index>(indexes_.size());
    auto const [segment, size, offset] = positionOf(index);
    if (segment == segmentCount) {
        throw std::length_error(errorTexts.get("TypesTooMany"));
    }
    auto& types = segments_[segment];
    if (!types) {
        types = std::make_unique<std::u16string[]>(size);
    }
    types[offset] = type;
    indexes_.emplace(types[offset], index);
    return last_ = index;
}

std::u16string const& TypeTable::operator[](Index index) const noexcept {
    auto const at = positionOf(index);
    return segments_[at.segment][at.offset];
}

} // namespace project::stores
