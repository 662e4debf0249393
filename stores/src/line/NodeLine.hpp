#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "line/LineAddress.hpp"
#include "project/stores/Change.hpp"

namespace project::stores {

/// The type of most nodes, which their lines leave out.
inline constexpr std::u16string_view plainNodeType = u"Info";

/// More levels of nested nodes than this a node may not have: reading one stays bounded.
inline constexpr std::size_t deepestNesting = 100;

/// Appends the line of a node, or of an address that was made without one when the node is null. Canonical;
/// without line end.
void appendNodeLine(std::string& out, AddressText const& address, Node const& node);

/// Appends the line by which a batch removes an address with all below it. Without line end.
void appendRemovalLine(std::string& out, AddressText const& address);

/// Appends the line of one step of a batch. Without line end.
void appendChangeLine(std::string& out, Change const& change);

/// Appends a nested node as it stands in its node's line.
void appendNestedNode(std::string& out, metadata::MetadataNode const& node);

/// @throws StoreError when the address or the node of a change is deeper than what the text can hold.
void requireWritable(Change const& change);

} // namespace project::stores
