#pragma once

#include "node/Standing.hpp"
#include "project/metadata/MetadataNode.hpp"

namespace project::stores {

/// True when a node says nothing that another one does not say: keys and nested nodes were taken away at
/// most, or moved. Taking something away from what the other side removes as a whole is no conflict.
bool isReductionOf(metadata::MetadataNode const& node, metadata::MetadataNode const& from);

/// The same for what stands at an address. An address without its node is a reduction too.
bool isReductionOf(Standing const& standing, Standing const& from);

} // namespace project::stores
