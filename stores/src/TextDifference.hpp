#pragma once

#include <cstddef>
#include <optional>
#include <vector>

#include "TextContent.hpp"

namespace project::stores {

/// The addresses at which something else stands in one content than in the other, sorted.
/// @return nothing when they are more than the limit.
///
/// Compares lines as they stand; only where they differ, or something is laid over them, nodes are made.
std::optional<std::vector<Address>> differences(TextContent const& left, TextContent const& right,
                                                std::size_t limit);

} // namespace project::stores
