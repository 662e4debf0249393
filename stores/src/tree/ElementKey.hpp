#pragma once

#include <compare>
#include <cstring>
#include <optional>
#include <string_view>

#include "tree/StoredName.hpp"
#include "tree/TypeTable.hpp"

namespace project::stores {

/// An element that is compared with entries of a tree. Everything that it is created from must outlive it.
class ElementKey {
public:
    ElementKey(TypeTable const& types, std::u16string_view type, std::u16string_view location) noexcept
        : types_(types), type_(type), name_(location) {}

    std::u16string_view type() const noexcept { return type_; }

    std::u16string_view location() const noexcept { return name_.text(); }

    bool isEqual(TypeTable::Index type, StoredName const& name) const noexcept {
        return name_.isEqual(name) && (compared_ == type ? std::is_eq(order_) : hasText(types_[type]));
    }

    /// The order of this element and an entry: by type, then by location, each by code units.
    std::strong_ordering compareWith(TypeTable::Index type, StoredName const& name) const noexcept {
        auto const order = compareTypes(type);
        return std::is_neq(order) ? order : name_.compareWith(name);
    }

private:
    /// The same as ==, which compares one code unit after the other.
    bool hasText(std::u16string_view type) const noexcept {
        return type.size() == type_.size() &&
               std::memcmp(type.data(), type_.data(), type.size() * sizeof(char16_t)) == 0;
    }

    /// Most comparisons of a search are with the same type.
    std::strong_ordering compareTypes(TypeTable::Index type) const noexcept {
        if (compared_ != type) {
            compared_ = type;
            order_ = type_ <=> std::u16string_view(types_[type]);
        }
        return order_;
    }

    TypeTable const& types_;
    std::u16string_view type_;
    NameKey name_;
    mutable std::optional<TypeTable::Index> compared_;
    mutable std::strong_ordering order_ = std::strong_ordering::equal;
};

} // namespace project::stores
