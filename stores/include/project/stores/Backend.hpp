#pragma once

#include "cmlink/ReentrantReadWriteLock.hpp"
#include "project/stores/Change.hpp"
#include "project/stores/Export.hpp"
#include "project/stores/Node.hpp"

namespace project::stores {

/// The access of a guard: to read or to write.
using Access = cmlink::ReentrantReadWriteLock::Access;

/// The storage behind a TreeMetadataManager.
///
/// The order of use: enter; then load as needed, and for each batch write followed by keep or discard; then
/// leave. enter, leave, write, keep and discard are called by one thread at a time; load may be called by
/// several readers, one at a time. A batch contains at least one change, and only changes that have an
/// effect.
class PROJECT_STORES_EXPORT Backend {
public:
    virtual ~Backend() = default;

    /// Called for the outermost guard of the process. Excludes other writers if the access is Write.
    /// @return the changes of other processes since the last call.
    virtual Changes enter(Access access) = 0;

    /// Ends what enter has begun: the process has released its last guard.
    virtual void leave() noexcept = 0;

    /// Passes on the addresses directly below one address; none for an address that does not exist. A batch
    /// that was written and not yet kept is included.
    virtual void load(Address const& parent, ChildSink& children) = 0;

    /// The same as a list.
    Children load(Address const& parent);

    /// Prepares a batch. The files that it creates exist when this returns.
    virtual FileChanges write(Batch const& batch) = 0;

    /// Commits the batch after the listeners were notified: it is durable and visible to others.
    virtual void keep() = 0;

    /// Rolls the batch back after a listener threw, or after write or keep failed.
    virtual void discard() noexcept = 0;
};

} // namespace project::stores
