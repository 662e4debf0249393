#pragma once

#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/stores/Node.hpp"

namespace project::stores {

using fl::filesystem::Path;

/// One step of a batch. The steps of a batch are applied in order.
struct Change {
    /// The effect of the step.
    enum class Kind {
        Set,    ///< stores the node at the address, in place of an earlier one
        Remove, ///< deletes the address and everything below it
        Create, ///< creates the address without a node; only for an address that does not exist
    };

    Kind kind;       ///< the effect
    Address address; ///< never the root's
    Node node;       ///< of Set, not null; otherwise null
};

/// The changes of one write, in their order.
using Batch = std::vector<Change>;

/// A change of another process at one address: a node was added, deleted or replaced, or the address was
/// created.
struct Difference {
    Address address; ///< where it is
    Node before;     ///< null if none was stored
    Node after;      ///< null if none is stored
};

/// The changes of other processes since the last check for changes.
struct Changes {
    bool everything = false; ///< the earlier content is unknown: discard everything that was loaded
    std::vector<Difference> differences; ///< by address, each once
};

/// The files that a batch created or deleted on disk, as absolute paths.
struct FileChanges {
    std::vector<Path> added;   ///< created files
    std::vector<Path> removed; ///< deleted files
};

} // namespace project::stores
