#pragma once

#include <map>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/Node.hpp"

namespace project::stores {

/// Joins nodes for one address so that nothing is lost. The result has the type of the last node, the keys of
/// all nodes (the later value where they differ), and the nested nodes of all. Nested nodes with the same
/// identity are joined in turn; nested nodes without an identifying key are kept once if they are equal.
///
/// Nested nodes keep the order of the earlier node; those that only the later node has follow. Adding a node
/// costs time in proportion to that node, not to the nodes joined before: a text may have any number of lines
/// for one address.
class NodeJoin {
public:
    explicit NodeJoin(metadata::MetadataNode const& first);

    void add(metadata::MetadataNode const& later);

    /// The joined node. Must be the last call.
    Node take() &&;

private:
    using ByIdentity = std::unordered_map<std::string, std::vector<metadata::MetadataNode*>>;

    ByIdentity& nestedIn(metadata::MetadataNode const& node);
    void addTo(metadata::MetadataNode& target, metadata::MetadataNode const& later);

    std::shared_ptr<metadata::MetadataNodeSpecification> joined_;
    std::u16string type_;
    std::map<metadata::MetadataNode const*, ByIdentity> nested_; ///< of the nodes that were added to
};

} // namespace project::stores
