#include "states/WorkTreeFolders.hpp"

#include "repository/DiskEntry.hpp"
#include "repository/TrackedFiles.hpp"

namespace project::git {

bool WorkTreeFolders::isFileIgnored(TreePath const& path) {
    return at(parentOf(path)).isIgnored || rules_.ignore(path, false);
}

bool WorkTreeFolders::isOtherRepository(TreePath const& folder) const {
    auto const name = repository_.workTree().onDisk(folder);
    auto const own = lookAt(name + "/.git");
    if (!own || S_ISDIR(own->st_mode)) {
        return own && lookAt(name + "/.git/HEAD").has_value();
    }
    auto const code = git_repository_open_ext(nullptr, name.c_str(), GIT_REPOSITORY_OPEN_NO_SEARCH, nullptr);
    return code == 0 || code == GIT_EOWNER;
}

WorkTreeFolders::Folder const& WorkTreeFolders::at(TreePath const& folder) {
    auto const known = folders_.find(folder);
    if (known != folders_.end()) {
        return known->second;
    }
    Folder result{FolderKind::Ours, false};
    if (!folder.empty()) {
        auto const above = at(parentOf(folder));
        result.kind = look(folder, above.kind);
        result.isIgnored =
            above.isIgnored || (result.kind == FolderKind::Ours && rules_.ignore(folder, true));
    }
    return folders_.try_emplace(folder, result).first->second;
}

FolderKind WorkTreeFolders::look(TreePath const& folder, FolderKind above) const {
    if (above != FolderKind::Ours) {
        return above;
    }
    auto const* const tracked = trackedAt(repository_.index(), folder);
    if (nameOf(folder) == ".git" || (tracked != nullptr && isSubmodule(*tracked))) {
        return FolderKind::OtherRepository;
    }
    auto const onDisk = lookAt(repository_.workTree().onDisk(folder));
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
