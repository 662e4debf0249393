#pragma once

#include "project/metadata/MetadataNode.hpp"

namespace project::stores {

/// Puts the keys of one node into another, over those that it has.
void putKeys(metadata::MetadataNode& target, metadata::MetadataNode const& from);

/// Puts the keys of one node into another, and copies of its nested nodes behind those that it has.
void copyInto(metadata::MetadataNode& target, metadata::MetadataNode const& from);

} // namespace project::stores
