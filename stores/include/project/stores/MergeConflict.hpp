#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "project/stores/Node.hpp"

namespace project::stores {

/// One of the two sides of a merge.
enum class MergeSide { Ours, Theirs };

/// A value in the common version and in both sides of a merge.
template <typename T>
struct ThreeWay {
    T base;   ///< in the common version
    T ours;   ///< on our side
    T theirs; ///< on their side

    /// Returns the value of one side.
    T const& of(MergeSide side) const noexcept { return side == MergeSide::Ours ? ours : theirs; }
};

/// One step from a node down to one nested in it.
struct NestedStep {
    std::u16string type;  ///< of the nested node
    std::u16string key;   ///< the identifying key, "UUID" or "Name"
    std::u16string value; ///< the value of that key
    std::size_t earlier;  ///< the number of preceding siblings with the same identity
};

/// Two changes that the merge cannot combine, so that a person must choose one.
struct MergeConflict {
    /// The contradiction.
    enum class Kind {
        Key,     ///< both sides set a key to different values, or one set and the other removed it
        Type,    ///< both sides changed the node's type
        Nested,  ///< one side changed a nested node and the other removed it
        Subtree, ///< one side removed an address with everything below it, and the other changed or added
                 ///< something there
    };

    Kind kind;       ///< the contradiction
    Address address; ///< of the node

    /// The path from the node of the address to the nested node; empty for the node itself.
    std::vector<NestedStep> nested;

    /// For Key: the key.
    std::u16string key;

    /// The side that removed something; nothing if both sides set or changed something.
    std::optional<MergeSide> removedBy;

    /// For Key and Type: the values; nothing for a version without the key or the node.
    ThreeWay<std::optional<std::u16string>> values;

    /// For Nested and Subtree: the nodes; null for a version without the node.
    ThreeWay<Node> nodes;

    /// For Subtree: the addresses that the other side added or changed, at or below the address, sorted.
    std::vector<Address> changed;
};

} // namespace project::stores
