#include "states/StateQuery.hpp"

#include "repository/DiskEntry.hpp"
#include "repository/TrackedFiles.hpp"

namespace project::git {

using cmlink::LocalStatus;

namespace {

bool isOfSameType(std::uint32_t left, std::uint32_t right) {
    return (left & S_IFMT) == (right & S_IFMT);
}

} // namespace

LocalStatus StateQuery::stateOf(fl::filesystem::Path const& path) {
    auto const place = repository_.workTree().relative(path);
    if (!place) {
        return LocalStatus::NotInRepository;
    }
    auto const entry = trackedAt(repository_.index(), *place);
    return entry ? trackedState(*entry) : untrackedState(*place);
}

bool StateQuery::isIgnored(fl::filesystem::Path const& path) {
    auto const place = repository_.workTree().relative(path);
    if (!place) {
        return true;
    }
    auto const above = folders_.kindOf(parentOf(*place));
    if (above == FolderKind::OtherRepository || above == FolderKind::BeyondLink) {
        return true;
    }
    auto const onDisk = reachableEntry(*place);
    if (onDisk && S_ISDIR(onDisk->st_mode)) {
        return folders_.kindOf(*place) == FolderKind::OtherRepository ||
               (folders_.isFolderIgnored(*place) && !isAnythingTrackedBelow(repository_.index(), *place));
    }
    return !trackedAt(repository_.index(), *place) && folders_.isFileIgnored(*place);
}

bool StateQuery::isLeftOut(fl::filesystem::Path const& path) {
    auto const place = repository_.workTree().relative(path);
    auto const entry = place ? trackedAt(repository_.index(), *place) : std::nullopt;
    return entry && !reachableEntry(*place) && isDiskIgnored(*entry, false);
}

LocalStatus StateQuery::trackedState(git_index_entry const& entry) {
    if (libgit().git_index_entry_is_conflict(&entry) != 0) {
        return LocalStatus::Conflicted;
    }
    auto const onDisk = reachableEntry(entry.path);
    bool const isThere = onDisk && (!S_ISDIR(onDisk->st_mode) || isSubmodule(entry));
    bool const isLeftOut = isDiskIgnored(entry, isThere);
    if (!isThere && !isLeftOut) {
        return LocalStatus::Modified;
    }
    auto const* const committed = repository_.head().find(entry.path);
    if (committed == nullptr) {
        return LocalStatus::Added;
    }
    auto const committedMode = libgit().git_tree_entry_filemode(committed);
    if (!isOfSameType(committedMode, entry.mode)) {
        return LocalStatus::Renamed;
    }
    auto const state = isLeftOut ? LocalStatus::Unmodified : presentState(entry, *onDisk);
    bool const isStaged = committedMode != entry.mode ||
                          libgit().git_oid_equal(libgit().git_tree_entry_id(committed), &entry.id) == 0;
    return state == LocalStatus::Unmodified && isStaged ? LocalStatus::Modified : state;
}

LocalStatus StateQuery::presentState(git_index_entry const& entry, struct stat const& onDisk) {
    if (isSubmodule(entry)) {
        return submoduleState(entry, onDisk);
    }
    if (!isOfSameType(modeOf(onDisk, &entry, repository_.settings()), entry.mode)) {
        return LocalStatus::Renamed;
    }
    return !isFileOrLink(onDisk) || comparison_.isModified(entry, onDisk) ? LocalStatus::Modified
                                                                          : LocalStatus::Unmodified;
}

LocalStatus StateQuery::submoduleState(git_index_entry const& entry, struct stat const& onDisk) const {
    if (!S_ISDIR(onDisk.st_mode)) {
        return LocalStatus::Renamed;
    }
    std::string const folder = repository_.workTree().onDisk(entry.path);
    git_repository* opened = nullptr;
    auto const code =
        libgit().git_repository_open_ext(&opened, folder.c_str(), GIT_REPOSITORY_OPEN_NO_SEARCH, nullptr);
    RepositoryHandle const submodule(opened);
    git_oid checkedOut{};
    if (code != 0 || libgit().git_reference_name_to_id(&checkedOut, opened, "HEAD") != 0) {
        return LocalStatus::Unmodified; // not checked out
    }
    return libgit().git_oid_equal(&checkedOut, &entry.id) != 0 ? LocalStatus::Unmodified
                                                               : LocalStatus::Modified;
}

LocalStatus StateQuery::untrackedState(TreePath const& path) {
    auto const above = folders_.kindOf(parentOf(path));
    auto const onDisk = reachableEntry(path);
    bool const isFolder = !onDisk || S_ISDIR(onDisk->st_mode);
    if (isFolder && isAnythingTrackedBelow(repository_.index(), path)) {
        return LocalStatus::Unmodified;
    }
    if (!path.empty() && repository_.head().find(path) != nullptr) {
        return LocalStatus::RemovalStaged;
    }
    if (above == FolderKind::OtherRepository || above == FolderKind::BeyondLink || nameOf(path) == ".git") {
        return LocalStatus::NotInRepository;
    }
    if (!onDisk || (!isFolder && !isFileOrLink(*onDisk))) {
        return LocalStatus::Unknown;
    }
    bool const isIgnored = isFolder ? folders_.isFolderIgnored(path) : folders_.isFileIgnored(path);
    return isIgnored ? LocalStatus::Ignored : LocalStatus::NotUnderSourceControl;
}

std::optional<struct stat> StateQuery::reachableEntry(TreePath const& path) {
    auto const above = folders_.kindOf(parentOf(path));
    if (above == FolderKind::Missing || above == FolderKind::BeyondLink) {
        return std::nullopt;
    }
    return diskEntryAt(repository_.workTree().onDisk(path));
}

/// Whether the state does not depend on the disk: because of a flag of the entry (git-update-index(1)), or
/// because a sparse checkout left the file out and it is not on disk (git-sparse-checkout(1)).
bool StateQuery::isDiskIgnored(git_index_entry const& entry, bool isOnDisk) const {
    bool const isSkipped = (entry.flags_extended & GIT_INDEX_ENTRY_SKIP_WORKTREE) != 0;
    return (entry.flags & GIT_INDEX_ENTRY_VALID) != 0 ||
           (isSkipped && !(isOnDisk && repository_.settings().isSparse));
}

} // namespace project::git
