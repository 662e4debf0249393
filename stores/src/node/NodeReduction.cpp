#include "node/NodeReduction.hpp"

#include <algorithm>
#include <string>
#include <vector>

#include "node/NestedIdentity.hpp"
#include "node/Siblings.hpp"

namespace project::stores {

using metadata::MetadataNode;

namespace {

bool hasOnlyKeysOf(MetadataNode const& node, MetadataNode const& from) {
    std::vector<std::u16string> const keys = node.getKeys();
    std::vector<std::u16string> const known = from.getKeys();
    return std::includes(known.begin(), known.end(), keys.begin(), keys.end()) &&
           std::all_of(keys.begin(), keys.end(),
                       [&](std::u16string const& key) { return node.get(key) == from.get(key); });
}

} // namespace

bool isReductionOf(MetadataNode const& node, MetadataNode const& from) {
    if (node.getType() != from.getType() || !hasOnlyKeysOf(node, from)) {
        return false;
    }
    Siblings const siblings({&from, &node, nullptr});
    return std::all_of(siblings.byRank().begin(), siblings.byRank().end(), [](auto const& nested) {
        if (nested.ours == nullptr || nested.base == nullptr) {
            return nested.ours == nullptr;
        }
        return !identifyingKey(*nested.ours) || isReductionOf(*nested.ours, *nested.base);
    });
}

bool isReductionOf(Standing const& standing, Standing const& from) {
    if (standing.node) {
        return from.node && isReductionOf(*standing.node, *from.node);
    }
    return !standing.made || static_cast<bool>(from);
}

} // namespace project::stores
