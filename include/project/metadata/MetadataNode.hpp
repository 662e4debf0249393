#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/metadata/Export.hpp"

namespace project::metadata {

/// The value at an address: a type, keys with values, and nested nodes, which have no address.
class PROJECT_METADATA_EXPORT MetadataNode {
public:
    virtual ~MetadataNode();

    /// Returns the value of a key; an empty string if the node does not have the key, so that an absent key
    /// and an empty value read alike. The reference is valid until the key is put again or the node is
    /// destroyed.
    virtual std::u16string const& get(std::u16string const& key) const = 0;

    /// Sets the value of a key, which the node may have or not.
    virtual void put(std::u16string key, std::u16string value) = 0;

    /// Returns the keys of the node, sorted by code units.
    virtual std::vector<std::u16string> getKeys() const = 0;

    /// Returns the type with which the node was created; empty for a node without a type.
    virtual std::u16string const& getType() const = 0;

    /// Returns the nested nodes in the order in which they were added. A pointer in the list is valid until
    /// that child is removed or the node is destroyed. addChild and removeChild change the list itself, so a
    /// loop that removes children iterates over a copy of the pointers.
    virtual std::vector<std::unique_ptr<MetadataNode>> const& getChildren() const = 0;

    /// Appends an empty nested node and returns it. This node owns it.
    virtual MetadataNode* addChild(std::u16string type) = 0;

    /// Removes and destroys a nested node of this node. Any other pointer is ignored.
    virtual void removeChild(MetadataNode* child) = 0;

protected:
    MetadataNode() = default;
    MetadataNode(MetadataNode const&) = default;
    MetadataNode& operator=(MetadataNode const&) = default;
};

/// Returns true if both nodes have the same type, the same keys with the same values, and equal nested nodes
/// in the same order.
PROJECT_METADATA_EXPORT bool isEqual(MetadataNode const& left, MetadataNode const& right);

} // namespace project::metadata
