#include "index/Staging.hpp"

#include "project/git/GitError.hpp"
#include "repository/DiskEntry.hpp"
#include "repository/TrackedFiles.hpp"
#include "rules/ContentRules.hpp"
#include "states/EntryComparison.hpp"
#include "states/WorkTreeFolders.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::git {

namespace {

void requireNothingForeign(std::string const& file, Conversion const& conversion) {
    if (!conversion.foreign.empty()) {
        throw GitError(GitError::Kind::Refused, file, errorTexts.get("StagedByGitOnly", conversion.foreign),
                       errorTexts.get("RemedyOfStaging"));
    }
}

void requireMovable(git_index_entry const& entry, std::string const& file) {
    if (isSubmodule(entry)) {
        throw GitError(GitError::Kind::Refused, file, errorTexts.get("SubmoduleMoved"),
                       errorTexts.get("RemedyOfSubmodule"));
    }
    if (((entry.flags & GIT_INDEX_ENTRY_STAGEMASK) >> GIT_INDEX_ENTRY_STAGESHIFT) != 0) {
        throw GitError(GitError::Kind::Refused, file, errorTexts.get("ConflictMoved"),
                       errorTexts.get("RemedyOfConflict"));
    }
}

} // namespace

void Staging::add(std::vector<fl::filesystem::Path> const& files) {
    auto const names = stageable(files);
    if (names.empty()) {
        return;
    }
    auto& update = openUpdate_();
    IndexChanges changes;
    BlobWriter blobs(repository_);
    for (auto const& [name, isConverted] : names) {
        stage(name, isConverted, blobs, changes);
    }
    update.apply(changes);
}

void Staging::remove(std::vector<fl::filesystem::Path> const& files) {
    auto& update = openUpdate_();
    IndexChanges changes;
    for (auto const& file : files) {
        auto const path = repository_.workTree().relativeInProject(file);
        if (path && trackedAt(repository_.index(), *path)) {
            changes.removed.insert(*path);
        }
        if (path) {
            removeBelow(*path, changes);
        }
    }
    update.apply(changes);
}

void Staging::move(std::vector<FileMove> const& moves) {
    auto& update = openUpdate_();
    auto const& index = repository_.index();
    IndexChanges changes;
    for (auto const& move : moves) {
        auto const from = repository_.workTree().relativeInProject(move.from);
        auto const to = repository_.workTree().relativeInProject(move.to);
        if (!from || !to) {
            continue;
        }
        auto position = index.firstFrom(*from);
        for (; position < index.size() && index.pathAt(position) == *from; ++position) {
            moveEntry(position, *to, changes);
        }
        for (position = firstBelow(index, *from);
             position < index.size() && isBelow(index.pathAt(position), *from); ++position) {
            moveEntry(position, *to + (index.pathAt(position) + from->size()), changes);
        }
    }
    update.apply(changes);
}

/// Gives an entry another name. A later comparison with the disk need not read the file, as far as it is as
/// it was: moving a file changes one of its times only.
void Staging::moveEntry(std::size_t position, TreePath const& path, IndexChanges& changes) const {
    auto entry = repository_.index().at(position);
    TreePath const old = entry.path;
    requireMovable(entry, repository_.workTree().onDisk(old));
    auto const onDisk = diskEntryAt(repository_.workTree().onDisk(path));
    if (onDisk && isFileOrLink(*onDisk)) {
        git_index_entry now{};
        record(*onDisk, now);
        bool const isSame = now.ino == entry.ino && now.mtime.seconds == entry.mtime.seconds &&
                            now.mtime.nanoseconds == entry.mtime.nanoseconds &&
                            now.file_size == entry.file_size;
        entry.ctime = isSame ? now.ctime : entry.ctime;
    }
    removeReplaced(path, changes);
    changes.removed.insert(old);
    changes.staged.insert_or_assign(path, entry);
    changes.moved.insert(path);
}

/// The files of the list that can be staged. Throws if there is one that only git can stage.
Staging::Names Staging::stageable(std::vector<fl::filesystem::Path> const& files) const {
    WorkTreeFolders folders(repository_);
    ContentRules rules(repository_);
    Names result;
    for (auto const& file : files) {
        auto const path = repository_.workTree().relativeInProject(file);
        if (!path || folders.kindOf(parentOf(*path)) != FolderKind::Ours || nameOf(*path) == ".git") {
            continue;
        }
        std::string const name = repository_.workTree().onDisk(*path);
        auto const onDisk = diskEntryAt(name);
        if (!onDisk || !isFileOrLink(*onDisk)) {
            continue;
        }
        auto const conversion = S_ISREG(onDisk->st_mode) ? rules.conversionOf(*path) : Conversion{};
        requireNothingForeign(name, conversion);
        result.try_emplace(*path, conversion.isNeeded);
    }
    return result;
}

void Staging::stage(TreePath const& path, bool isConverted, BlobWriter& blobs, IndexChanges& changes) const {
    auto const onDisk = diskEntryAt(repository_.workTree().onDisk(path)); // before it is read, for its times
    git_index_entry entry{};
    if (!onDisk || !isFileOrLink(*onDisk) || !blobs.write(path, *onDisk, isConverted, entry.id)) {
        return; // deleted in the meantime
    }
    record(*onDisk, entry);
    auto const tracked = trackedAt(repository_.index(), path);
    entry.mode = modeOf(*onDisk, tracked ? &*tracked : nullptr, repository_.settings());
    removeReplaced(path, changes);
    changes.staged.insert_or_assign(path, entry);
}

/// Removes entries for a folder in whose place there is a file on disk, or the reverse.
void Staging::removeReplaced(TreePath const& path, IndexChanges& changes) const {
    for (std::string folder = parentOf(path); !folder.empty(); folder = parentOf(folder)) {
        if (trackedAt(repository_.index(), folder)) {
            changes.removed.insert(folder);
        }
    }
    removeBelow(path, changes);
}

void Staging::removeBelow(TreePath const& folder, IndexChanges& changes) const {
    auto const& index = repository_.index();
    for (std::size_t position = firstBelow(index, folder);
         position < index.size() && isBelow(index.pathAt(position), folder); ++position) {
        changes.removed.insert(index.pathAt(position));
    }
}

} // namespace project::git
