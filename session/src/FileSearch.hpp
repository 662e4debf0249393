#pragma once

#include "project/session/Query.hpp"
#include "project/session/ToolAccess.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// Visits the files that a query finds, in the store's order, each once: a folder before its contents, and
/// the contents by name. The caller holds a guard of the store.
/// @param personal the store of personal labels; read only for a condition on labels.
/// @param root of the project.
void visitFound(Query const& query, stores::TreeMetadataManager& store, stores::TreeMetadataManager& personal,
                Path const& root, FileVisitor const& visitor);

} // namespace project::session
