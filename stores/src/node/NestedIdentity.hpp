#pragma once

#include <optional>
#include <string>

#include "project/metadata/MetadataNode.hpp"

namespace project::stores {

/// The key whose value tells a nested node from its siblings of the same type: "UUID", or "Name" where that
/// has no value; nothing for a node that has neither.
std::optional<std::u16string> identifyingKey(metadata::MetadataNode const& node);

/// What tells a nested node from its siblings: its type and its identifying key, or else all of it.
std::string identityOf(metadata::MetadataNode const& node);

} // namespace project::stores
