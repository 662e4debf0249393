#pragma once

#include "project/stores/Backend.hpp"

namespace project::stores {

/// Stores nothing: the definition exists only in the tree of the TreeMetadataManager and ends with the
/// process. For tests and for projects that are never saved.
class PROJECT_STORES_EXPORT MemoryBackend : public Backend {
public:
    Changes enter(Access access) override;
    /// Does nothing.
    void leave() noexcept override;
    using Backend::load;
    void load(Address const& parent, ChildSink& children) override;
    FileChanges write(Batch const& batch) override;
    void keep() override;
    void discard() noexcept override;
};

} // namespace project::stores
