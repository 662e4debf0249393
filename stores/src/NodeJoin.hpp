#pragma once

#include "project/stores/Backend.hpp"

namespace project::stores {

/// Joins two nodes that stand for one address, so that nothing of either is lost: the later one's type, the
/// keys of both with the later one's value where they differ, and the nested nodes of both. A nested node of
/// the later one is joined with the earlier one's of the same type and "UUID", or "Name" where it has no
/// "UUID"; one without both is kept unless an equal one is there.
///
/// Nested nodes keep the earlier one's order; those that only the later one has follow.
/// @param earlier not null. @param later not null.
Node joinNodes(Node const& earlier, Node const& later);

} // namespace project::stores
