#pragma once

#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/stores/Node.hpp"

namespace project::stores {

using fl::filesystem::Path;

/// One step of a batch. The steps of a batch are applied in order.
struct Change {
    enum class Kind {
        Set,    ///< the node replaces what stands at the address
        Remove, ///< the address goes with everything below it
        Make,   ///< the address comes into being without a node; given only where nothing exists
    };

    Kind kind;
    Address address; ///< never the root's
    Node node;       ///< of Set, not null; otherwise null
};

using Batch = std::vector<Change>;

/// What others have changed at one address: a node came, went or became another, or the address was made.
struct Difference {
    Address address;
    Node before; ///< null where none was stored
    Node after;  ///< null where none is stored
};

/// What others have changed since the last look.
struct Changes {
    bool everything = false; ///< nothing is known of what was there before: forget all that was loaded
    std::vector<Difference> differences;
};

/// The files on disk that came into being or went with a batch, absolute.
struct FileChanges {
    std::vector<Path> added;
    std::vector<Path> removed;
};

} // namespace project::stores
