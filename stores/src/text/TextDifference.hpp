#pragma once

#include <vector>

#include "text/TextContent.hpp"

namespace project::stores {

/// The addresses whose states differ between two contents, sorted.
///
/// Compares lines, and creates nodes only where lines differ or an overlay covers them.
std::vector<Difference> differences(TextContent const& before, TextContent const& after);

/// Adds the difference between two states of an address, if there is one.
void addIfDifferent(std::vector<Difference>& found, Address const& address, AddressState const& before,
                    AddressState const& after);

/// Appends later changes to earlier ones.
void addChanges(Changes& earlier, Changes later);

} // namespace project::stores
