#include "states/WorkTreeFolders.hpp"

#include "repository/DiskEntry.hpp"
#include "repository/TrackedFiles.hpp"

namespace project::git {

bool WorkTreeFolders::isFileIgnored(TreePath const& path) {
    return at(parentOf(path)).isIgnored || rules_.isIgnored(path, false);
}

/// As in git, the files of a repository decide, not its owner or its format.
bool WorkTreeFolders::isOtherRepository(TreePath const& folder) const {
    auto const& workTree = repository_.workTree();
    std::string const name = workTree.onDisk(folder);
    return diskEntryAt(name + "/.git") && isRepositoryFound(name, workTree.onDisk(parentOf(folder)));
}

WorkTreeFolders::Folder const& WorkTreeFolders::at(TreePath const& folder) {
    auto const known = folders_.find(folder);
    if (known != folders_.end()) {
        return known->second;
    }
    Folder result{FolderKind::Ours, false};
    if (!folder.empty()) {
        auto const above = at(parentOf(folder));
        result.kind = determineKind(folder, above.kind);
        result.isIgnored =
            above.isIgnored || (result.kind == FolderKind::Ours && rules_.isIgnored(folder, true));
    }
    return folders_.try_emplace(folder, result).first->second;
}

FolderKind WorkTreeFolders::determineKind(TreePath const& folder, FolderKind above) const {
    if (above != FolderKind::Ours) {
        return above;
    }
    auto const tracked = trackedAt(repository_.index(), folder);
    if (nameOf(folder) == ".git" || (tracked && isSubmodule(*tracked))) {
        return FolderKind::OtherRepository;
    }
    auto const onDisk = diskEntryAt(repository_.workTree().onDisk(folder));
    if (!onDisk) {
        return FolderKind::Missing;
    }
    if (S_ISLNK(onDisk->st_mode)) {
        return FolderKind::BeyondLink;
    }
    if (!S_ISDIR(onDisk->st_mode)) {
        return FolderKind::Missing;
    }
    return isOtherRepository(folder) ? FolderKind::OtherRepository : FolderKind::Ours;
}

} // namespace project::git
