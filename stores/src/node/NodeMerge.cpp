#include "node/NodeMerge.hpp"

#include <algorithm>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "node/NestedNodes.hpp"
#include "node/Siblings.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"

namespace project::stores {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;

namespace {

using Values = ThreeWay<std::optional<std::u16string>>;
using Nodes = Siblings::Versions;

/// A merged nested node, before it is known whether the result has it and in which position.
struct Draft {
    MetadataNode const* unchanged =
        nullptr; ///< the merged node equals this one, and the other members are empty
    std::u16string type;
    std::map<std::u16string, std::u16string> keys;
    std::vector<Draft> children;
};

void write(MetadataNode& target, Draft const& draft) {
    if (draft.unchanged != nullptr) {
        copyInto(target, *draft.unchanged);
    }
    for (auto const& [key, value] : draft.keys) {
        target.put(key, value);
    }
    for (Draft const& child : draft.children) {
        write(*target.addChild(child.type), child);
    }
}

Draft unchanged(MetadataNode const& node) {
    return {&node, node.getType(), {}, {}};
}

Node copyOf(MetadataNode const* node) {
    return node == nullptr ? nullptr : std::make_shared<MetadataNodeSpecification>(*node);
}

/// True for a nested node whose only key is its identity. It exists for the sake of its nested nodes, like a
/// category on a file.
bool isContainer(MetadataNode const& node) {
    return identifyingKey(node) && node.getKeys().size() == 1;
}

std::map<std::u16string, Values> keysOf(Nodes const& nodes) {
    std::map<std::u16string, Values> keys;
    auto const take = [&](MetadataNode const* node, std::optional<std::u16string> Values::*value) {
        if (node != nullptr) {
            for (std::u16string const& key : node->getKeys()) {
                keys[key].*value = node->get(key);
            }
        }
    };
    take(nodes.base, &Values::base);
    take(nodes.ours, &Values::ours);
    take(nodes.theirs, &Values::theirs);
    return keys;
}

bool hasOnlyKeysOf(MetadataNode const& node, MetadataNode const& earlier) {
    std::vector<std::u16string> const keys = node.getKeys();
    std::vector<std::u16string> const known = earlier.getKeys();
    return std::includes(known.begin(), known.end(), keys.begin(), keys.end()) &&
           std::all_of(keys.begin(), keys.end(),
                       [&](std::u16string const& key) { return node.get(key) == earlier.get(key); });
}

bool isReductionOf(MetadataNode const& node, MetadataNode const& earlier) {
    if (node.getType() != earlier.getType() || !hasOnlyKeysOf(node, earlier)) {
        return false;
    }
    Siblings const siblings({&earlier, &node, nullptr});
    return std::all_of(siblings.byRank().begin(), siblings.byRank().end(), [](Nodes const& nested) {
        if (nested.ours == nullptr || nested.base == nullptr) {
            return nested.ours == nullptr;
        }
        return !identifyingKey(*nested.ours) || isReductionOf(*nested.ours, *nested.base);
    });
}

/// Merges one node that both sides have, and its nested nodes.
class NodeMerge {
public:
    NodeMerge(Address const& address, Decide const& decide) : address_(address), decide_(decide) {}

    Node merge(Nodes const& nodes) {
        Draft const merged = both(nodes);
        auto node = std::make_shared<MetadataNodeSpecification>(merged.type);
        write(*node, merged);
        return node;
    }

private:
    /// Merges a node that both sides have.
    Draft both(Nodes const& nodes) {
        Draft draft;
        std::optional<std::u16string> const base =
            nodes.base == nullptr ? std::nullopt : std::optional(nodes.base->getType());
        Values types{base, nodes.ours->getType(), nodes.theirs->getType()};
        draft.type = *value(MergeConflict::Kind::Type, {}, std::move(types));
        for (auto& [key, values] : keysOf(nodes)) {
            if (auto merged = value(MergeConflict::Kind::Key, key, std::move(values))) {
                draft.keys.emplace(key, *std::move(merged));
            }
        }
        draft.children = children(nodes);
        return draft;
    }

    std::optional<std::u16string> value(MergeConflict::Kind kind, std::u16string const& key, Values values) {
        if (values.ours == values.theirs || values.theirs == values.base) {
            return values.ours;
        }
        if (values.ours == values.base) {
            return values.theirs;
        }
        MergeConflict conflict = conflictOf(kind);
        conflict.key = key;
        if (!values.ours || !values.theirs) {
            conflict.removedBy = values.ours ? MergeSide::Theirs : MergeSide::Ours;
        }
        conflict.values = values;
        return values.of(decide_(std::move(conflict)));
    }

    std::vector<Draft> children(Nodes const& parents) {
        Siblings const siblings(parents);
        std::vector<std::optional<Draft>> merged;
        std::vector<bool> isKept;
        merged.reserve(siblings.byRank().size());
        isKept.reserve(siblings.byRank().size());
        for (std::size_t rank = 0; rank < siblings.byRank().size(); ++rank) {
            merged.push_back(child(siblings.byRank()[rank], siblings.earlier(rank)));
            isKept.push_back(merged.back().has_value());
        }
        std::vector<Draft> result;
        for (std::size_t const rank : siblings.mergedOrder(isKept)) {
            result.push_back(*std::move(merged[rank]));
        }
        return result;
    }

    std::optional<Draft> child(Nodes const& nodes, std::size_t earlier) {
        MetadataNode const* const present = nodes.ours != nullptr ? nodes.ours : nodes.theirs;
        if (present == nullptr) {
            return std::nullopt;
        }
        std::optional<std::u16string> const key = identifyingKey(*present);
        bool const isInBoth = nodes.ours != nullptr && nodes.theirs != nullptr;
        if (!key) { // identified by its whole content, which therefore is the same in all versions
            return isInBoth || nodes.base == nullptr ? std::optional(unchanged(*present)) : std::nullopt;
        }
        path_.push_back({present->getType(), *key, present->get(*key), earlier});
        std::optional<Draft> draft = isInBoth                ? kept(nodes)
                                     : nodes.base == nullptr ? std::optional(unchanged(*present))
                                                             : removed(nodes, *present);
        path_.pop_back();
        return draft;
    }

    /// Merges a nested node that both sides have. The result does not have a container if the two sides
    /// together removed everything that was nested in it.
    std::optional<Draft> kept(Nodes const& nodes) {
        Draft draft = both(nodes);
        bool const isEmptied = draft.children.empty() && !nodes.ours->getChildren().empty() &&
                               !nodes.theirs->getChildren().empty();
        if (isEmptied && isContainer(*nodes.ours) && isContainer(*nodes.theirs)) {
            return std::nullopt;
        }
        return draft;
    }

    /// Merges a nested node that one side removed. The result keeps a container with the nodes that the other
    /// side added to it.
    std::optional<Draft> removed(Nodes const& nodes, MetadataNode const& present) {
        if (isContainer(present) && isContainer(*nodes.base)) {
            Draft draft{nullptr, present.getType(), {}, children(nodes)};
            for (std::u16string const& name : present.getKeys()) {
                draft.keys.emplace(name, present.get(name));
            }
            return draft.children.empty() ? std::nullopt : std::optional(std::move(draft));
        }
        if (isReductionOf(present, *nodes.base)) {
            return std::nullopt;
        }
        MergeConflict conflict = conflictOf(MergeConflict::Kind::Nested);
        conflict.removedBy = nodes.ours == nullptr ? MergeSide::Ours : MergeSide::Theirs;
        conflict.nodes = {copyOf(nodes.base), copyOf(nodes.ours), copyOf(nodes.theirs)};
        bool const isRemoved = nodes.of(decide_(std::move(conflict))) == nullptr;
        return isRemoved ? std::nullopt : std::optional(unchanged(present));
    }

    MergeConflict conflictOf(MergeConflict::Kind kind) const {
        return {kind, address_, path_, {}, std::nullopt, {}, {}, {}};
    }

    Address const& address_;
    Decide const& decide_;
    std::vector<NestedStep> path_;
};

} // namespace

bool isReductionOf(AddressState const& state, AddressState const& earlier) {
    if (state.node) {
        return earlier.node && isReductionOf(*state.node, *earlier.node);
    }
    return !state.isCreated || static_cast<bool>(earlier);
}

AddressState mergeStates(Address const& address, ThreeWay<AddressState> const& states, Decide const& decide) {
    auto const& [base, ours, theirs] = states;
    if (ours.node && theirs.node) {
        Nodes const nodes{base.node.get(), ours.node.get(), theirs.node.get()};
        return {NodeMerge(address, decide).merge(nodes), false};
    }
    if (!base.node && ours && theirs) { // one side created the address without a node, the other with one
        return ours.node ? ours : theirs;
    }
    bool const isRemovedByOurs = !ours || (theirs && !ours.node);
    if (isReductionOf(isRemovedByOurs ? theirs : ours, base)) {
        return isRemovedByOurs ? ours : theirs;
    }
    MergeConflict conflict{MergeConflict::Kind::Subtree, address, {}, {}, std::nullopt, {}, {}, {address}};
    conflict.removedBy = isRemovedByOurs ? MergeSide::Ours : MergeSide::Theirs;
    conflict.nodes = {base.node, ours.node, theirs.node};
    return states.of(decide(std::move(conflict)));
}

} // namespace project::stores
