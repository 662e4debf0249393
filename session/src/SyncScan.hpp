#pragma once

#include <string>
#include <vector>

#include "DiskComparison.hpp"
#include "FileTree.hpp"
#include "SyncRules.hpp"
#include "project/git/GitAdapter.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/session/Sync.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// Compares the folders that have rules with the disk. The caller holds a guard of the store.
///
/// git is asked only about files that are new.
class SyncScan {
public:
    /// @param store, root, git borrowed.
    SyncScan(stores::TreeMetadataManager& store, Path const& root, git::GitAdapter& git);

    /// Makes the comparison. Call it once.
    SyncPlan run();

private:
    void compare(std::u16string const& folder);
    void enterNew(std::vector<FoundFile> found);
    std::vector<FoundFile> notIgnored(std::vector<FoundFile> const& found);
    bool isWanted(FoundFile const& file) const;
    bool usesGit(FoundFile const& file) const;
    void remove(std::vector<FoundFile> const& gone);
    void findMissing();
    void findAbsent();
    void findLosses();

    Path absolute(std::u16string const& path) const;

    std::u16string relative(Path const& path) const { return metadata::getRelativePath(root_, path); }

    stores::TreeMetadataManager& store_;
    Path const& root_;
    git::GitAdapter& git_;
    FileTree files_;
    SyncRules rules_;
    SyncPlan plan_;
};

} // namespace project::session
