#pragma once

#include <map>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/Node.hpp"

namespace project::stores {

/// Joins nodes that stand for one address, so that nothing of any is lost: the last one's type, the keys of
/// all with the later one's value where they differ, and the nested nodes of all. A nested node of a later
/// one is joined with the earlier one's of the same type and "UUID", or "Name" where it has no "UUID"; one
/// without both is kept unless an equal one is there.
///
/// Nested nodes keep the earlier one's order; those that only the later one has follow. Adding a node costs
/// what that node has and not what was joined before, since a text may have any number of lines for one
/// address.
class NodeJoin {
public:
    explicit NodeJoin(metadata::MetadataNode const& first);

    void add(metadata::MetadataNode const& later);

    /// All that was joined. To be called last.
    Node take() &&;

private:
    using ByIdentity = std::unordered_map<std::string, std::vector<metadata::MetadataNode*>>;

    ByIdentity& nestedIn(metadata::MetadataNode const& node);
    void addTo(metadata::MetadataNode& target, metadata::MetadataNode const& later);

    std::shared_ptr<metadata::MetadataNodeSpecification> joined_;
    std::u16string type_;
    std::map<metadata::MetadataNode const*, ByIdentity> nested_; ///< of nodes that something was added to
};

/// Joins two nodes.
/// @param earlier not null. @param later not null.
Node joinNodes(Node const& earlier, Node const& later);

} // namespace project::stores
