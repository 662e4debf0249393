#pragma once

#include <vector>

#include "cm/CMActionManager.hpp"
#include "cmlink/CMAdapter.hpp"
#include "project/cm/NotedFiles.hpp"
#include "project/metadata/FileChangeRequestListener.hpp"

namespace project::management {

/// Combines the files that a caller adds or removes with the files that the store creates or deletes for
/// it, and passes them to source control in one call.
///
/// The caller's files are noted first. Then the store, during its write, notifies this listener. Noted
/// files wait for the next notification of their kind, whatever write it belongs to: they are kept even if
/// the change is refused. An exception of source control propagates to the store, and these files are not
/// tried again.
///
/// It has no lock of its own. If several threads use the project, hold the store's write guard from the
/// note until the operation has returned: the store notifies of every write, also those of other threads.
class CMProjectFileEventHandler : public metadata::FileChangeRequestListener {
public:
    /// @param adapter borrowed; must outlive this object.
    /// @param root the project's root folder.
    CMProjectFileEventHandler(cmlink::CMAdapter& adapter, Path const& root);

    void fileRemovalRequested(metadata::MetadataManager& store, Path const& metadataRoot,
                              std::vector<Path> const& files) override;
    void fileAdditionRequested(metadata::MetadataManager& store, std::vector<Path> const& files) override;
    bool acceptsFileChangeRequests() override;

    /// Call it before these files are added.
    void noteAddition(std::vector<Path> const& files);

    /// Call it before these files are removed.
    void noteRemoval(std::vector<Path> const& files);

    /// Replaces the noted files. @return the earlier ones.
    NotedFiles exchangeNoted(NotedFiles files);

private:
    cmlink::CMAdapter& adapter_;
    CMActionManager actionManager_;
    Path root_;
    NotedFiles noted_;
};

} // namespace project::management
