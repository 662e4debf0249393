#pragma once

#include <set>
#include <vector>

#include "cm/CMActionManager.hpp"
#include "cmlink/CMAdapter.hpp"
#include "project/metadata/FileChangeRequestListener.hpp"

namespace project::management {

/// Joins what a caller adds or removes with what the store reports to write or delete for it, and has source
/// control follow in one batch.
///
/// First what the caller named is noted; then the store, from within its write, reports. What is noted waits
/// for the next report of its kind, however it comes about: it is not forgotten when the change is refused.
/// What source control throws goes on to the store, and the batch is not tried again.
///
/// There is no lock: notes and reports of one project must not overlap.
class CMProjectFileEventHandler : public metadata::FileChangeRequestListener {
public:
    /// @param adapter borrowed; must outlive this object.
    /// @param root the project's root folder.
    CMProjectFileEventHandler(cmlink::CMAdapter& adapter, Path const& root);

    void fileRemovalRequested(metadata::MetadataManager& store, Path const& metadataRoot,
                              std::vector<Path> const& files) override;
    void fileAdditionRequested(metadata::MetadataManager& store, std::vector<Path> const& files) override;
    bool acceptsFileChangeRequests() override;

    /// These files are about to be added.
    void noteAddition(std::vector<Path> const& files);

    /// These files are about to be removed.
    void noteRemoval(std::vector<Path> const& files);

private:
    cmlink::CMAdapter& adapter_;
    CMActionManager actionManager_;
    Path root_;
    std::set<Path> pendingAdditions_;
    std::set<Path> pendingRemovals_;
};

} // namespace project::management
