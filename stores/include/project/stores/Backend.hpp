#pragma once

#include "cmlink/ReentrantReadWriteLock.hpp"
#include "project/stores/Change.hpp"
#include "project/stores/Export.hpp"
#include "project/stores/Node.hpp"

namespace project::stores {

using Access = cmlink::ReentrantReadWriteLock::Access;

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
