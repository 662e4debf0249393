#include "NodeJoin.hpp"

#include <deque>
#include <map>
#include <memory>
#include <set>
#include <string>

#include "JsonText.hpp"
#include "NodeLine.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"

namespace project::stores {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;

namespace {

/// What tells a nested node from its siblings: its type and one of two keys, or else all of it.
std::string identityOf(MetadataNode const& node) {
    std::string identity;
    for (std::u16string const key : {u"UUID", u"Name"}) {
        std::u16string const& value = node.get(key);
        if (!value.empty()) {
            appendJsonString(identity, node.getType());
            appendJsonString(identity, key);
            appendJsonString(identity, value);
            return identity;
        }
    }
    appendNestedNode(identity, node);
    return identity;
}

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

/// The nested nodes of a node, to be found by those of another one; each is found once.
class Partners {
public:
    explicit Partners(MetadataNode const& node) {
        for (auto const& child : node.getChildren()) {
            byIdentity_[identityOf(*child)].push_back(child.get());
        }
    }

    /// The next nested node with the identity of this one, or null.
    MetadataNode const* take(MetadataNode const& node) {
        auto const found = byIdentity_.find(identityOf(node));
        if (found == byIdentity_.end() || found->second.empty()) {
            return nullptr;
        }
        MetadataNode const* const partner = found->second.front();
        found->second.pop_front();
        taken_.insert(partner);
        return partner;
    }

    bool isTaken(MetadataNode const& partner) const { return taken_.contains(&partner); }

private:
    std::map<std::string, std::deque<MetadataNode const*>> byIdentity_;
    std::set<MetadataNode const*> taken_;
};

void joinInto(MetadataNode& target, MetadataNode const& earlier, MetadataNode const& later) {
    putKeys(target, earlier);
    putKeys(target, later);
    Partners partners(later);
    for (auto const& child : earlier.getChildren()) {
        MetadataNode& joined = *target.addChild(child->getType());
        if (MetadataNode const* const partner = partners.take(*child)) {
            joinInto(joined, *child, *partner);
        } else {
            copyInto(joined, *child);
        }
    }
    for (auto const& child : later.getChildren()) {
        if (!partners.isTaken(*child)) {
            copyInto(*target.addChild(child->getType()), *child);
        }
    }
}

} // namespace

Node joinNodes(Node const& earlier, Node const& later) {
    auto joined = std::make_shared<MetadataNodeSpecification>(later->getType());
    joinInto(*joined, *earlier, *later);
    return joined;
}

} // namespace project::stores
