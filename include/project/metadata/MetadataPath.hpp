#pragma once

#include <compare>
#include <cstddef>
#include <span>
#include <string_view>
#include <utility>
#include <vector>

#include "project/metadata/Export.hpp"
#include "project/metadata/PathElement.hpp"

namespace project::metadata {

/// An address in the metadata tree: the steps from the tree's root down to one position.
///
/// A value. Addresses share common steps: a copy increments one counter, a child is one
/// allocation, and a comparison stops at the first shared step. Several threads may read one value at the
/// same time.
class PROJECT_METADATA_EXPORT MetadataPath {
public:
    /// The address with these steps, from the root down. An empty list, also as MetadataPath({}), is the
    /// root's address.
    MetadataPath(std::vector<PathElement> elements);

    /// Returns the address of the tree's root.
    static MetadataPath root() noexcept { return MetadataPath(LastStep(), nullptr); }

    /// Shares the steps with the other address.
    MetadataPath(MetadataPath const& other) noexcept;
    MetadataPath& operator=(MetadataPath const& other) noexcept;

    /// Leaves the root's address in the other one.
    MetadataPath(MetadataPath&& other) noexcept : step_(std::exchange(other.step_, nullptr)) {}

    /// Takes the steps of the other address.
    MetadataPath& operator=(MetadataPath&& other) noexcept {
        std::swap(step_, other.step_);
        return *this;
    }

    ~MetadataPath();

    /// Returns the steps from the root down. The list is created at the first call and is valid as long as
    /// any address that shares its last step exists. Two threads may call this at the same time.
    std::vector<PathElement> const& getPath() const;

    /// Returns a copy of the last step; for the root, a step with an empty type and location.
    PathElement getLeaf() const;

    /// Returns the last step without a copy. The address must not be the root's.
    PathElement const& leaf() const noexcept;

    /// Returns the step at an index, counted from the root, without a copy. The index must be less than
    /// depth(). The cost is one pointer for each step after it.
    PathElement const& operator[](std::size_t index) const noexcept;

    /// Replaces the elements of a list by pointers to the steps from the root down. They are valid as long as
    /// this address. The cost is one pointer for each step.
    void listSteps(std::vector<PathElement const*>& steps) const;

    /// Returns the number of steps; 0 for the root.
    std::size_t depth() const noexcept;

    /// Returns the address without its last step. The parent of the root is the root.
    MetadataPath parent() const;

    /// Returns the address one step below.
    MetadataPath child(PathElement element) const;

    /// Keeps the first steps of this address, and replaces those behind them by steps of one type. Reuses the
    /// memory of steps that no other address contains: an address that is changed again and again costs
    /// almost no allocations.
    /// @param kept at most depth().
    /// @param locations of the new steps, in texts of others.
    void replaceSteps(std::size_t kept, std::u16string_view type,
                      std::span<std::u16string_view const> locations);

    /// Returns true if this address is the other one or below it.
    bool isWithin(MetadataPath const& other) const noexcept;

    /// Compares step by step from the root: an address directly precedes the addresses below it.
    PROJECT_METADATA_EXPORT friend std::strong_ordering compare(MetadataPath const& left,
                                                                MetadataPath const& right) noexcept;

private:
    struct Step;

    /// Selects the constructor below. With a pointer alone, MetadataPath({}) would be ambiguous.
    struct LastStep {};

    /// True if no other address contains any of the steps behind the first ones.
    bool isAloneBehind(std::size_t first) const noexcept;

    /// Takes over one use of a step.
    MetadataPath(LastStep, Step const* last) noexcept : step_(last) {}

    /// One use of the last step, which counts its uses itself: an address is one pointer, and a step with the
    /// usual kind of shared pointer would be a third larger. Null for the root.
    Step const* step_;
};

/// Compares two addresses step by step, from the root down. An address precedes everything below it.
PROJECT_METADATA_EXPORT std::strong_ordering compare(MetadataPath const& left,
                                                     MetadataPath const& right) noexcept;

/// Returns whether an address precedes another one, as compare orders them.
inline bool operator<(MetadataPath const& left, MetadataPath const& right) noexcept {
    return std::is_lt(compare(left, right));
}

/// Returns whether two addresses have the same steps.
inline bool operator==(MetadataPath const& left, MetadataPath const& right) noexcept {
    return std::is_eq(compare(left, right));
}

} // namespace project::metadata
