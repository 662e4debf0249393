#include "index/IndexUpdate.hpp"

#include <utility>

#include "index/IndexPatch.hpp"
#include "project/git/GitError.hpp"
#include "repository/DiskEntry.hpp"
#include "repository/TrackedFiles.hpp"
#include "states/EntryComparison.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::git {

namespace {

void requireIntact(IndexContent const& index, std::string const& file) {
    if (!index.hasValidChecksum()) {
        throw GitError(GitError::Kind::Failed, file, errorTexts.get("IndexSumWrong"),
                       errorTexts.get("RemedyOfWrongSum"));
    }
}

} // namespace

IndexUpdate::IndexUpdate(Repository& repository) : repository_(repository), lock_(repository.indexFile()) {
    repository_.refresh();
    requireIntact(repository_.index(), repository_.indexFile());
    old_ = repository_.sharedIndex();
}

IndexUpdate::~IndexUpdate() {
    if (old_ != nullptr) {
        repository_.showIndex(old_);
    }
}

void IndexUpdate::apply(IndexChanges const& changes) {
    if (changes.empty()) {
        return;
    }
    requireValidNames(changes);
    auto const file = repository_.indexFile();
    auto prepared = std::make_shared<IndexContent>(IndexPatch(repository_.index()).apply(changes), file);
    lock_.reserve(prepared->bytes().size());
    for (auto const& [path, entry] : changes.staged) {
        staged_.insert(path);
    }
    for (auto const& path : changes.moved) {
        staged_.erase(path);
    }
    new_ = std::move(prepared);
    repository_.showIndex(new_);
}

void IndexUpdate::publish() {
    if (new_ == nullptr) {
        return;
    }
    markHiddenChanges();
    new_->seal();
    auto const stamp = lock_.replaceIndex(new_->bytes());
    repository_.showIndex(new_, stamp);
    old_ = nullptr;
}

/// libgit2 checks the names: an index must not contain some that other systems treat as ".git".
void IndexUpdate::requireValidNames(IndexChanges const& changes) const {
    git_index* created = nullptr;
    require(libgit().git_index_new(&created), repository_.indexFile(), "IndexNotWritten");
    IndexHandle const checked(created);
    for (auto const& [path, staged] : changes.staged) {
        auto entry = staged;
        entry.path = path.c_str();
        require(libgit().git_index_add(created, &entry), repository_.workTree().onDisk(path),
                "IndexCannotContain");
    }
}

/// An entry that is as young as the old index is older than the new one.
void IndexUpdate::markHiddenChanges() {
    EntryComparison comparison(repository_);
    for (std::size_t position = 0; position < new_->size(); ++position) {
        if (!comparison.canHideChanges(new_->secondsAt(position)) ||
            staged_.contains(new_->pathAt(position))) {
            continue;
        }
        auto const entry = new_->at(position);
        auto const onDisk = diskEntryAt(repository_.workTree().onDisk(entry.path));
        if (!isSubmodule(entry) && onDisk && isFileOrLink(*onDisk) && comparison.isModified(entry, *onDisk)) {
            new_->markForReading(position);
        }
    }
}

} // namespace project::git
