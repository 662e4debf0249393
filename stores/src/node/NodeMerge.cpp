#include "node/NodeMerge.hpp"

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "node/NestedIdentity.hpp"
#include "node/NodeCopy.hpp"
#include "node/NodeReduction.hpp"
#include "node/Siblings.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"

namespace project::stores {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;

namespace {

using Values = ThreeWay<std::optional<std::u16string>>;
using Nodes = Siblings::Versions;

/// A merged node. Made before it is known whether anything is left of it, and in which place.
struct Draft {
    MetadataNode const* unchanged = nullptr; ///< it is this node, and all else is empty
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

/// True for a nested node that says nothing but what it is: it is there for the sake of what is nested in it,
/// as a category is on a file.
bool isMerePlace(MetadataNode const& node) {
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
        std::vector<bool> stays;
        merged.reserve(siblings.byRank().size());
        stays.reserve(siblings.byRank().size());
        for (std::size_t rank = 0; rank < siblings.byRank().size(); ++rank) {
            merged.push_back(child(siblings.byRank()[rank], siblings.earlier(rank)));
            stays.push_back(merged.back().has_value());
        }
        std::vector<Draft> result;
        for (std::size_t const rank : mergedOrder(siblings.order(), stays)) {
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
        bool const shared = nodes.ours != nullptr && nodes.theirs != nullptr;
        if (!key) { // told by all of it, so that it can't have changed
            return shared || nodes.base == nullptr ? std::optional(unchanged(*present)) : std::nullopt;
        }
        way_.push_back({present->getType(), *key, present->get(*key), earlier});
        std::optional<Draft> draft = shared                  ? kept(nodes)
                                     : nodes.base == nullptr ? std::optional(unchanged(*present))
                                                             : removed(nodes, *present);
        way_.pop_back();
        return draft;
    }

    /// Merges a nested node that both sides have. Where they removed all that was nested in a mere place,
    /// each a part of it, nothing is left.
    std::optional<Draft> kept(Nodes const& nodes) {
        Draft draft = both(nodes);
        bool const emptied = draft.children.empty() && !nodes.ours->getChildren().empty() &&
                             !nodes.theirs->getChildren().empty();
        if (emptied && isMerePlace(*nodes.ours) && isMerePlace(*nodes.theirs)) {
            return std::nullopt;
        }
        return draft;
    }

    /// A nested node that one side has removed. What the other side has put into a mere place stays.
    std::optional<Draft> removed(Nodes const& nodes, MetadataNode const& present) {
        if (isMerePlace(present) && isMerePlace(*nodes.base)) {
            Draft draft{nullptr, present.getType(), {}, children(nodes)};
            putKeys(draft, present);
            return draft.children.empty() ? std::nullopt : std::optional(std::move(draft));
        }
        if (isReductionOf(present, *nodes.base)) {
            return std::nullopt;
        }
        MergeConflict conflict = conflictOf(MergeConflict::Kind::Nested);
        conflict.removedBy = nodes.ours == nullptr ? MergeSide::Ours : MergeSide::Theirs;
        conflict.nodes = {copyOf(nodes.base), copyOf(nodes.ours), copyOf(nodes.theirs)};
        bool const goes = nodes.of(decide_(std::move(conflict))) == nullptr;
        return goes ? std::nullopt : std::optional(unchanged(present));
    }

    static void putKeys(Draft& draft, MetadataNode const& from) {
        for (std::u16string const& key : from.getKeys()) {
            draft.keys.emplace(key, from.get(key));
        }
    }

    MergeConflict conflictOf(MergeConflict::Kind kind) const {
        return {kind, address_, way_, {}, std::nullopt, {}, {}, {}};
    }

    Address const& address_;
    Decide const& decide_;
    std::vector<NestedStep> way_;
};

} // namespace

Standing mergeStandings(Address const& address, ThreeWay<Standing> const& standings, Decide const& decide) {
    auto const& [base, ours, theirs] = standings;
    if (ours.node && theirs.node) {
        Nodes const nodes{base.node.get(), ours.node.get(), theirs.node.get()};
        return {NodeMerge(address, decide).merge(nodes), false};
    }
    if (!base.node && ours && theirs) { // one side made the address, the other put a node there
        return ours.node ? ours : theirs;
    }
    bool const byOurs = !ours || (theirs && !ours.node);
    if (isReductionOf(byOurs ? theirs : ours, base)) {
        return byOurs ? ours : theirs;
    }
    MergeConflict conflict{MergeConflict::Kind::Subtree, address, {}, {}, std::nullopt, {}, {}, {address}};
    conflict.removedBy = byOurs ? MergeSide::Ours : MergeSide::Theirs;
    conflict.nodes = {base.node, ours.node, theirs.node};
    return standings.of(decide(std::move(conflict)));
}

} // namespace project::stores
