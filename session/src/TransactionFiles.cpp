#include "TransactionFiles.hpp"

#include <algorithm>
#include <iterator>
#include <utility>

#include "project/metadata/MetadataFunctions.hpp"

namespace project::session {

using management::NotedFiles;

TransactionFiles::TransactionFiles(management::CMAwareProjectManager* sourceControl, IsInProject isInProject)
    : sourceControl_(sourceControl), isInProject_(std::move(isInProject)) {
}

void TransactionFiles::add(ChangedFiles const& files) {
    files_.added.insert(files_.added.end(), files.added.begin(), files.added.end());
    files_.removed.insert(files_.removed.end(), files.removed.begin(), files.removed.end());
}

void TransactionFiles::move(std::vector<Move> const& moves) {
    ChangedFiles changed;
    for (auto const& move : moves) {
        for (auto const& file : files_.added) {
            if (file == move.from || metadata::isParent(file, move.from)) {
                changed.added.push_back(move.to / Path(metadata::getRelativePath(move.from, file)));
                changed.removed.push_back(file);
            }
        }
        for (auto const& file : files_.removed) {
            if (file == move.to || metadata::isParent(file, move.to)) {
                changed.added.push_back(file);
            }
        }
    }
    add(changed);
}

void TransactionFiles::dropSince(Mark mark) noexcept {
    auto const drop = [](std::vector<Path>& files, std::size_t count) {
        files.erase(files.begin() + static_cast<std::ptrdiff_t>(count), files.end());
    };
    drop(files_.added, mark.added);
    drop(files_.removed, mark.removed);
    hasDropped_ = true;
}

void TransactionFiles::beginTransaction() {
    if (sourceControl_ != nullptr) {
        earlier_ = sourceControl_->exchangeNotedFiles({});
    }
}

void TransactionFiles::passToSourceControl() {
    if (sourceControl_ == nullptr) {
        return;
    }
    auto noted = sourceControl_->exchangeNotedFiles({});
    if (needsFiltering()) { // otherwise the managers have noted these very files
        noted = filtered();
    }
    noted.additions.insert(earlier_.additions.begin(), earlier_.additions.end());
    noted.removals.insert(earlier_.removals.begin(), earlier_.removals.end());
    sourceControl_->exchangeNotedFiles(std::move(noted));
}

void TransactionFiles::restoreEarlier() noexcept {
    if (sourceControl_ != nullptr) {
        sourceControl_->exchangeNotedFiles(std::exchange(earlier_, {}));
    }
}

void TransactionFiles::clear() noexcept {
    files_ = {};
    earlier_ = {};
    hasDropped_ = false;
}

std::vector<Path> TransactionFiles::takeAdded() {
    auto result = addedInTheEnd();
    clear();
    return result;
}

/// A file that was removed and added again is not removed. A folder is: it may have returned with some of its
/// files only.
NotedFiles TransactionFiles::filtered() const {
    auto const added = addedInTheEnd();
    NotedFiles result{{added.begin(), added.end()}, {}};
    for (auto const& file : files_.removed) {
        if (!result.additions.contains(file) || metadata::is_directory(file)) {
            result.removals.insert(file);
        }
    }
    return result;
}

bool TransactionFiles::needsFiltering() const noexcept {
    return hasDropped_ || (!files_.added.empty() && !files_.removed.empty());
}

std::vector<Path> TransactionFiles::addedInTheEnd() const {
    if (files_.removed.empty()) {
        return files_.added;
    }
    std::vector<Path> result;
    std::ranges::copy_if(files_.added, std::back_inserter(result), isInProject_);
    return result;
}

} // namespace project::session
