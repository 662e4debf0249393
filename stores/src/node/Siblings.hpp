#pragma once

#include <cstddef>
#include <vector>

#include "node/NestedOrder.hpp"
#include "project/metadata/MetadataNode.hpp"
#include "project/stores/MergeConflict.hpp"

namespace project::stores {

/// The nested nodes of one node in three versions, each brought together with what it is in the others: by
/// identity, and where a version has an identity several times, the first with the first and so on. So a
/// node that is there twice on purpose counts twice.
class Siblings {
public:
    /// One nested node; null in a version that does not have it.
    using Versions = ThreeWay<metadata::MetadataNode const*>;

    /// @param parents null for a version without the node. They must outlive this object.
    explicit Siblings(Versions const& parents);

    /// The nested nodes by rank, which is their order by identity.
    std::vector<Versions> const& byRank() const noexcept { return byRank_; }

    /// How many of the same identity come before the one of a rank.
    std::size_t earlier(std::size_t rank) const noexcept { return earlier_[rank]; }

    /// The ranks in the order of each version.
    ThreeWay<Ranks> const& order() const noexcept { return order_; }

private:
    std::vector<Versions> byRank_;
    std::vector<std::size_t> earlier_;
    ThreeWay<Ranks> order_;
};

} // namespace project::stores
