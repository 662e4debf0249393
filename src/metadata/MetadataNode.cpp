#include "project/metadata/MetadataNode.hpp"

#include <algorithm>

namespace project::metadata {

MetadataNode::~MetadataNode() = default;

bool isEqual(MetadataNode const& left, MetadataNode const& right) {
    if (left.getType() != right.getType()) {
        return false;
    }
    auto const keys = left.getKeys();
    if (keys != right.getKeys()) {
        return false;
    }
    auto const sameValue = [&](std::u16string const& key) { return left.get(key) == right.get(key); };
    if (!std::all_of(keys.begin(), keys.end(), sameValue)) {
        return false;
    }
    auto const& children = left.getChildren();
    auto const& others = right.getChildren();
    return std::equal(children.begin(), children.end(), others.begin(), others.end(),
                      [](auto const& child, auto const& other) { return isEqual(*child, *other); });
}

} // namespace project::metadata
