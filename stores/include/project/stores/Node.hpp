#pragma once

#include <memory>
#include <vector>

#include "project/metadata/MetadataNode.hpp"
#include "project/metadata/MetadataPath.hpp"
#include "project/stores/Export.hpp"

namespace project::stores {

using Address = metadata::MetadataPath;

/// A stored node. It never changes once it is stored, and its users share it. Null where none is stored.
using Node = std::shared_ptr<metadata::MetadataNode const>;

/// The node of type "Info" without keys and children. Most nodes are equal to it, and all of them share this
/// one.
PROJECT_STORES_EXPORT Node const& plainNode();

/// One address directly below another.
struct Child {
    metadata::PathElement element;
    Node node;        ///< null when none is stored there
    bool made;        ///< there is no node, and the address stays also when nothing lies below it
    bool hasChildren; ///< something is stored below; when false, nothing is
};

/// What lies directly below one address, sorted by element, each element once. Every child has a node, was
/// made, or has children.
using Children = std::vector<Child>;

} // namespace project::stores
