#pragma once

#include <stdexcept>
#include <string>
#include <string_view>

#include <project/metadata/MetadataNode.hpp>
#include <project/stores/Node.hpp>

namespace sqlite_store {

/// The bytes are not a node, or a node is nested too deeply.
class NodeBytesError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/// Returns a text as bytes that have the order of its code units: the higher byte of each comes first. Any
/// code units are possible, also those that UTF-8 cannot express.
std::string bytesOf(std::u16string_view text);

/// Returns the text of such bytes.
/// @throws NodeBytesError if they are not code units.
std::u16string textOf(std::string_view bytes);

/// Returns a node as bytes: its type, its keys with their values, and its nested nodes.
/// @throws NodeBytesError if it is nested too deeply.
std::string bytesOf(project::metadata::MetadataNode const& node);

/// Returns the node of such bytes.
/// @throws NodeBytesError if they are not a node.
project::stores::Node nodeOf(std::string_view bytes);

} // namespace sqlite_store
