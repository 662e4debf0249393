#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/metadata/Export.hpp"

namespace project::metadata {

/// What is stored at an address: a type, values by key, and nested nodes that have no address of their own.
class PROJECT_METADATA_EXPORT MetadataNode {
public:
    virtual ~MetadataNode();

    /// The value of a key; an empty string when the node does not have it, so that an absent key and an
    /// empty value read alike. The reference is valid until the key is put again or the node goes.
    virtual std::u16string const& get(std::u16string const& key) const = 0;

    /// Sets the value of a key, whether or not the node has it.
    virtual void put(std::u16string key, std::u16string value) = 0;

    /// The keys that the node has, sorted by code units.
    virtual std::vector<std::u16string> getKeys() const = 0;

    /// The type that the node was made with; empty when none was given.
    virtual std::u16string const& getType() const = 0;

    /// The nested nodes in the order in which they were added. A pointer in the list is valid until that
    /// child is removed or the node goes; the list itself changes with addChild and removeChild, so a loop
    /// that removes children walks a copy of the pointers.
    virtual std::vector<std::unique_ptr<MetadataNode>> const& getChildren() const = 0;

    /// Appends a new empty nested node, which this node owns.
    virtual MetadataNode* addChild(std::u16string type) = 0;

    /// Destroys a nested node of this node. A pointer to anything else changes nothing.
    virtual void removeChild(MetadataNode* child) = 0;

protected:
    MetadataNode() = default;
    MetadataNode(MetadataNode const&) = default;
    MetadataNode& operator=(MetadataNode const&) = default;
};

/// True when both have the same type, the same keys with the same values, and equal children in the same
/// order.
PROJECT_METADATA_EXPORT bool isEqual(MetadataNode const& left, MetadataNode const& right);

} // namespace project::metadata
