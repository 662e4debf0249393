#include "node/NestedIdentity.hpp"

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

} // namespace project::stores
