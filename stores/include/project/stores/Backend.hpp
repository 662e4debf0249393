#pragma once

#include <memory>
#include <vector>

#include "cmlink/ReentrantReadWriteLock.hpp"
#include "fl/filesystem/Path.hpp"
#include "project/metadata/MetadataNode.hpp"
#include "project/metadata/MetadataPath.hpp"
#include "project/stores/Export.hpp"

namespace project::stores {

using Access = cmlink::ReentrantReadWriteLock::Access;
using Address = metadata::MetadataPath;
using fl::filesystem::Path;

/// A stored node: never changed once it is stored, shared by whoever needs it. Null where none is stored.
using Node = std::shared_ptr<metadata::MetadataNode const>;

/// The node of type "Info" without keys and children. Most nodes are like it, and all of them share this one.
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

/// Where a TreeMetadataManager keeps its tree.
///
/// The order of use: enter; then load as needed, and for each batch write followed by keep or discard; then
/// leave. enter, leave, write, keep and discard come from one thread at a time; load may come from several
/// readers, one at a time. A batch holds only real changes and at least one.
class PROJECT_STORES_EXPORT Backend {
public:
    virtual ~Backend() = default;

    /// At the outermost guard of the process: keeps other writers out if the access is to write, and tells
    /// which addresses others have changed since the last time.
    virtual Changes enter(Access access) = 0;

    virtual void leave() noexcept = 0;

    /// What is stored directly below one address, with the batch that was written and not yet kept in it.
    /// Empty for an address that does not exist.
    virtual Children load(Address const& parent) = 0;

    /// Prepares a batch. The files that it brings into being are there when this returns.
    virtual FileChanges write(Batch const& batch) = 0;

    /// After the listeners: the batch stands, durable, seen by others.
    virtual void keep() = 0;

    /// A listener threw, or write or keep failed: all is as it was before the batch.
    virtual void discard() noexcept = 0;
};

} // namespace project::stores
