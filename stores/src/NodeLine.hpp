#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

#include "LineAddress.hpp"
#include "project/stores/Backend.hpp"

namespace project::stores {

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

/// A line that was read, or why it could not be.
struct ParsedLine {
    std::optional<Change> change;
    char const* problem; ///< a clause; null when there is a change
};

/// Reads any line of a body or a batch, however its JSON is laid out.
ParsedLine parseLine(std::string_view line);

/// Reads a line of a body, where nothing is removed.
ParsedLine parseBodyLine(std::string_view line);

/// The node of a line that parses, null for one of an address that was made without.
Node nodeOfLine(std::string_view line);

} // namespace project::stores
