#pragma once

#include <optional>
#include <string>

#include "project/metadata/MetadataNode.hpp"

namespace project::stores {

// What joining and merging need of nested nodes: their identity, and copies of them.

/// The key that identifies a nested node among its siblings of the same type: "UUID", or "Name" if the node
/// has no UUID; nothing if it has neither.
std::optional<std::u16string> identifyingKey(metadata::MetadataNode const& node);

/// The nested identity of a node: its type with the identifying key and that key's value, or its whole
/// content if it has no identifying key.
std::string identityOf(metadata::MetadataNode const& node);

/// Copies the keys of one node into another, where they replace keys of the same name.
void copyKeys(metadata::MetadataNode& target, metadata::MetadataNode const& from);

/// Copies the keys and the nested nodes of one node into another, the nested nodes behind the existing ones.
void copyInto(metadata::MetadataNode& target, metadata::MetadataNode const& from);

} // namespace project::stores
