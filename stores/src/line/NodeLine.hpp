#pragma once

#include <string>
#include <string_view>

#include "line/LineAddress.hpp"
#include "project/metadata/MetadataNode.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/stores/Change.hpp"

namespace project::stores {

/// The type of most nodes. Lines omit it.
inline constexpr std::u16string_view plainNodeType = metadata::schema::nodeType;

/// The maximum number of levels of nested nodes. It bounds the recursion of readers.
inline constexpr std::size_t deepestNesting = 100;

/// Appends the canonical line of a node, without line end.
/// @param node null for an address that was created without a node.
void appendNodeLine(std::string& out, AddressText const& address, Node const& node);

/// Appends the line by which a batch removes an address and everything below it, without line end.
void appendRemovalLine(std::string& out, AddressText const& address);

/// Appends the line of one change of a batch, without line end.
void appendChangeLine(std::string& out, Change const& change);

/// Appends a nested node in the form that it has in the line of its node.
void appendNestedNode(std::string& out, metadata::MetadataNode const& node);

/// @throws StoreError if the address or the node of the change is too deep for the text.
void requireWritable(Change const& change);

} // namespace project::stores
