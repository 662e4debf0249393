#pragma once

#include <compare>
#include <cstddef>
#include <memory>
#include <vector>

#include "project/metadata/Export.hpp"
#include "project/metadata/PathElement.hpp"

namespace project::metadata {

/// An address in the metadata tree: the steps from the tree's root down to one place.
///
/// An immutable value. Addresses share the steps that they have in common, so that a copy costs one counter
/// and a child one allocation; comparing stops where two addresses share their steps. Values may be read
/// from several threads at once.
class PROJECT_METADATA_EXPORT MetadataPath {
public:
    /// The address with these steps, from the root down. No steps give the address of the root.
    MetadataPath(std::vector<PathElement> elements);

    /// The address of the tree's root.
    static MetadataPath root() noexcept { return MetadataPath(std::shared_ptr<Step const>()); }

    MetadataPath(MetadataPath const&) = default;
    MetadataPath& operator=(MetadataPath const&) = default;
    MetadataPath(MetadataPath&&) noexcept = default;
    MetadataPath& operator=(MetadataPath&&) noexcept = default;
    ~MetadataPath();

    /// The steps from the root down. The list is made at the first call and lives as long as any address
    /// that shares its last step; two threads may ask at once.
    std::vector<PathElement> const& getPath() const;

    /// The last step; one with an empty type and location for the root.
    PathElement getLeaf() const;

    /// The last step, without a copy. The address must not be the root's.
    PathElement const& leaf() const noexcept;

    /// The step at an index counted from the root, without a copy. The index must be below depth(); costs a
    /// pointer for each step behind it.
    PathElement const& operator[](std::size_t index) const noexcept;

    /// How many steps there are; 0 for the root.
    std::size_t depth() const noexcept;

    /// The address without its last step; the root's for the root.
    MetadataPath parent() const;

    /// The address one step further down.
    MetadataPath child(PathElement element) const;

    /// True when this address is the other one or lies below it.
    bool isWithin(MetadataPath const& other) const noexcept;

    /// Compares step by step from the root, so that an address comes right before all that lies below it.
    PROJECT_METADATA_EXPORT friend std::strong_ordering compare(MetadataPath const& left,
                                                                MetadataPath const& right) noexcept;

private:
    struct Step;

    explicit MetadataPath(std::shared_ptr<Step const> step) noexcept;

    std::shared_ptr<Step const> step_;
};

PROJECT_METADATA_EXPORT std::strong_ordering compare(MetadataPath const& left,
                                                     MetadataPath const& right) noexcept;

inline bool operator<(MetadataPath const& left, MetadataPath const& right) noexcept {
    return std::is_lt(compare(left, right));
}

inline bool operator==(MetadataPath const& left, MetadataPath const& right) noexcept {
    return std::is_eq(compare(left, right));
}

} // namespace project::metadata
