#include "node/NestedNodes.hpp"

#include "line/JsonText.hpp"
#include "line/NodeLine.hpp"

namespace project::stores {

using metadata::MetadataNode;

std::optional<std::u16string> identifyingKey(MetadataNode const& node) {
    for (std::u16string key : {u"UUID", u"Name"}) {
        if (!node.get(key).empty()) {
            return key;
        }
    }
    return std::nullopt;
}

std::string identityOf(MetadataNode const& node) {
    std::string identity;
    if (std::optional<std::u16string> const key = identifyingKey(node)) {
        appendJsonString(identity, node.getType());
        appendJsonString(identity, *key);
        appendJsonString(identity, node.get(*key));
    } else {
        appendNestedNode(identity, node);
    }
    return identity;
}

void copyKeys(MetadataNode& target, MetadataNode const& from) {
    for (std::u16string const& key : from.getKeys()) {
        target.put(key, from.get(key));
    }
}

void copyInto(MetadataNode& target, MetadataNode const& from) {
    copyKeys(target, from);
    for (auto const& child : from.getChildren()) {
        copyInto(*target.addChild(child->getType()), *child);
    }
}

} // namespace project::stores
