#include "NodeJoin.hpp"

#include <deque>
#include <map>
#include <memory>
#include <set>
#include <string>

#include "NestedIdentity.hpp"
#include "NodeCopy.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"

namespace project::stores {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;

namespace {

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
