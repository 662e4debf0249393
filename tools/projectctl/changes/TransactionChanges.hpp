#pragma once

#include <vector>

#include "project/OpenProject.hpp"
#include "project/stores/Change.hpp"

namespace projectctl {

/// The nodes that the open transaction of a project has changed, by address: the differences between the
/// text, which does not contain the transaction, and the store. Visits the whole definition.
std::vector<project::stores::Difference> changesOfTransaction(OpenProject& project);

/// The same for the personal layer. Does not read it if the transaction has not changed it.
std::vector<project::stores::Difference> personalChangesOfTransaction(OpenProject& project);

} // namespace projectctl
