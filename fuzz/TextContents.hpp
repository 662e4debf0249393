#pragma once

#include <map>
#include <string>

#include "text/ProjectText.hpp"

namespace project::fuzz {

/// The line that a writer writes for each address.
using Contents = std::map<stores::Address, std::string>;

/// Walks through a whole text. Children must be sorted, each must have a node, be created without one or have
/// children, and have children exactly if it says so.
Contents contentsOf(stores::ProjectText const& text);

/// The canonical body of the nodes that the same walk finds. Cheaper than a map.
std::string canonicalOf(stores::ProjectText const& text);

/// Requires a text that was written: canonical, without a tail and without faults.
void requireTidy(stores::ProjectText const& text);

} // namespace project::fuzz
