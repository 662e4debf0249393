#include "node/NodeCopy.hpp"

#include <string>

namespace project::stores {

using metadata::MetadataNode;

void putKeys(MetadataNode& target, MetadataNode const& from) {
    for (std::u16string const& key : from.getKeys()) {
        target.put(key, from.get(key));
    }
}

void copyInto(MetadataNode& target, MetadataNode const& from) {
    putKeys(target, from);
    for (auto const& child : from.getChildren()) {
        copyInto(*target.addChild(child->getType()), *child);
    }
}

} // namespace project::stores
