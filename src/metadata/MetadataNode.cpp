#include "project/metadata/MetadataNode.hpp"

#include <algorithm>
#include <typeinfo>

#include "project/metadata/MetadataNodeSpecification.hpp"

namespace project::metadata {

MetadataNode::~MetadataNode() = default;

namespace {

bool isSpecification(MetadataNode const& node) {
    return typeid(node) == typeid(MetadataNodeSpecification);
}

bool hasEqualValuesByKey(MetadataNode const& left, MetadataNode const& right) {
    auto const keys = left.getKeys();
    return keys == right.getKeys() && std::all_of(keys.begin(), keys.end(), [&](std::u16string const& key) {
               return left.get(key) == right.get(key);
           });
}

} // namespace

bool isEqual(MetadataNode const& left, MetadataNode const& right) {
    if (left.getType() != right.getType()) {
        return false;
    }
    bool const hasEqualValues = isSpecification(left) && isSpecification(right)
                                    ? static_cast<MetadataNodeSpecification const&>(left).hasEqualValues(
                                          static_cast<MetadataNodeSpecification const&>(right))
                                    : hasEqualValuesByKey(left, right);
    if (!hasEqualValues) {
        return false;
    }
    auto const& children = left.getChildren();
    auto const& others = right.getChildren();
    return std::equal(children.begin(), children.end(), others.begin(), others.end(),
                      [](auto const& child, auto const& other) { return isEqual(*child, *other); });
}

} // namespace project::metadata
