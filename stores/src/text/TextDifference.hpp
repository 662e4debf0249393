#pragma once

#include <vector>

#include "text/TextContent.hpp"

namespace project::stores {

/// Where something else stands in one content than in the other, sorted.
///
/// Compares lines as they stand; only where they differ, or something is laid over them, nodes are made.
std::vector<Difference> differences(TextContent const& before, TextContent const& after);

/// Notes a difference if there is one.
void addIfDifferent(std::vector<Difference>& found, Address const& address, Standing const& before,
                    Standing const& after);

} // namespace project::stores
