#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "project/stores/Node.hpp"

namespace project::stores {

/// Whose version stands.
enum class MergeSide { Ours, Theirs };

/// The same thing in the common version and in both that are merged.
template <typename T>
struct ThreeWay {
    T base;
    T ours;
    T theirs;

    T const& of(MergeSide side) const noexcept { return side == MergeSide::Ours ? ours : theirs; }
};

/// One step from a node down to one nested in it.
struct NestedStep {
    std::u16string type;
    std::u16string key;   ///< the key that tells it from its siblings, "UUID" or "Name"
    std::u16string value; ///< and that key's value
    std::size_t earlier;  ///< how many siblings that are told by the same come before it
};

/// Two changes that exclude each other, so that a person has to choose one.
struct MergeConflict {
    enum class Kind {
        Key,     ///< a key that both set to different values, or that one changed and the other removed
        Type,    ///< both gave the node another type
        Nested,  ///< a nested node that one changed and the other removed
        Subtree, ///< an address that one removed with all below it, where the other changed or added
                 ///< something
    };

    Kind kind;
    Address address;

    /// The way from the address's node down to the nested node that is meant; no steps for the node itself.
    std::vector<NestedStep> nested;

    /// Of Key: the key.
    std::u16string key;

    /// Who removed it; nothing where both set or changed something.
    std::optional<MergeSide> removedBy;

    /// Of Key and Type: the values; nothing where a version does not have the key or the node.
    ThreeWay<std::optional<std::u16string>> values;

    /// Of Nested and Subtree: the nodes; null where a version has none there.
    ThreeWay<Node> nodes;

    /// Of Subtree: what the side that did not remove it added or changed, the address itself or what lies
    /// below it, sorted.
    std::vector<Address> changed;
};

} // namespace project::stores
