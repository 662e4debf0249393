#pragma once

#include <cstddef>
#include <vector>

#include "project/metadata/MetadataNode.hpp"
#include "project/stores/MergeConflict.hpp"

namespace project::stores {

/// The nested nodes of one node in three versions, matched with each other by identity. If a version has an
/// identity several times, the first is matched with the first, the second with the second; a node that
/// occurs twice on purpose therefore counts twice.
///
/// Every matched node has a rank: a number from 0 up, the same in all versions, in the order of the
/// identities.
class Siblings {
public:
    using Ranks = std::vector<std::size_t>;

    /// One nested node; null in a version that does not have it.
    using Versions = ThreeWay<metadata::MetadataNode const*>;

    /// @param parents null for a version without the node. They must outlive this object.
    explicit Siblings(Versions const& parents);

    /// The nested nodes by rank.
    std::vector<Versions> const& byRank() const noexcept { return byRank_; }

    /// The number of preceding siblings that have the same identity as the node of this rank.
    std::size_t earlier(std::size_t rank) const noexcept { return earlier_[rank]; }

    /// The merged order, which does not change if ours and theirs are exchanged.
    ///
    /// Nodes of both sides keep the order that both sides have. If the orders differ, the order of the side
    /// that moved nodes wins; if both moved them or both added them, the order that is smaller by rank wins.
    /// A node of one side stays behind the node of both sides that it follows there; of two such runs in the
    /// same position, the smaller comes first.
    /// @param isKept by rank: false for a node that the merged node does not have.
    Ranks mergedOrder(std::vector<bool> const& isKept) const;

private:
    std::vector<Versions> byRank_;
    std::vector<std::size_t> earlier_;
    ThreeWay<Ranks> order_; ///< the ranks in the order of each version
};

} // namespace project::stores
