#include "node/NodeJoin.hpp"

#include <utility>

#include "node/NestedNodes.hpp"

namespace project::stores {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;

NodeJoin::NodeJoin(MetadataNode const& first)
    : joined_(std::make_shared<MetadataNodeSpecification>(first)), type_(first.getType()) {
}

void NodeJoin::add(MetadataNode const& later) {
    type_ = later.getType();
    addTo(*joined_, later);
}

Node NodeJoin::take() && {
    if (joined_->getType() != type_) {
        auto const typed = std::make_shared<MetadataNodeSpecification>(type_);
        copyInto(*typed, *joined_);
        return typed;
    }
    return std::move(joined_);
}

NodeJoin::ByIdentity& NodeJoin::nestedIn(MetadataNode const& node) {
    auto const [found, isNew] = nested_.try_emplace(&node);
    if (isNew) {
        for (auto const& child : node.getChildren()) {
            found->second[identityOf(*child)].push_back(child.get());
        }
    }
    return found->second;
}

void NodeJoin::addTo(MetadataNode& target, MetadataNode const& later) {
    copyKeys(target, later);
    if (later.getChildren().empty()) {
        return;
    }
    ByIdentity& known = nestedIn(target);
    std::unordered_map<std::string, std::size_t> counts;
    for (auto const& child : later.getChildren()) {
        std::string identity = identityOf(*child);
        auto& same = known[identity];
        std::size_t const earlier = counts[std::move(identity)]++;
        if (earlier >= same.size()) {
            same.push_back(target.addChild(child->getType()));
            copyInto(*same.back(), *child);
        } else if (identifyingKey(*child)) { // otherwise the two are equal
            addTo(*same[earlier], *child);
        }
    }
}

} // namespace project::stores
