#include "OpenMoves.hpp"

#include <algorithm>
#include <iterator>
#include <set>
#include <utility>

#include "DiskEntries.hpp"

namespace project::session {

namespace {

Move reversed(Move const& move) {
    return {move.to, move.from};
}

/// Moves a file if it is at its old path only. @return false if there is something at both paths.
bool moveIfDue(Move const& move) {
    if (!diskEntry(move.from)) {
        return true;
    }
    if (!isFree(move)) {
        return false;
    }
    moveOnDisk(move);
    syncNames({move});
    return true;
}

std::vector<Move> inOneList(MoveGroups const& groups) {
    std::vector<Move> result;
    for (auto const& group : groups) {
        result.insert(result.end(), group.begin(), group.end());
    }
    return result;
}

std::vector<git::FileMove> forGit(std::vector<Move> const& moves) {
    std::vector<git::FileMove> result;
    result.reserve(moves.size());
    for (auto const& move : moves) {
        result.push_back({move.from, move.to});
    }
    return result;
}

} // namespace

OpenMoves::OpenMoves(Path const& root, Path const& storeFolder, git::GitAdapter* adapter,
                     Definition definition)
    : adapter_(adapter), definition_(std::move(definition)), record_(root, storeFolder) {
}

void OpenMoves::make(std::vector<Move> const& moves) {
    auto groups = made_;
    groups.push_back(moves);
    hasRecord_ = true;
    write(groups);
    auto const before = made_.size();
    made_.emplace_back();
    try {
        for (auto const& move : moves) {
            moveOnDisk(move);
            made_.back().push_back(move);
        }
        syncNames(moves);
        definition_.followInOthers(moves, false);
    } catch (...) {
        undoBehind(before);
        throw;
    }
}

void OpenMoves::write(MoveGroups const& groups) {
    record_.write({definition_.state(), indexState(), groups});
}

std::string OpenMoves::indexState() const {
    return adapter_ == nullptr ? std::string() : adapter_->indexState();
}

void OpenMoves::undoBehind(std::size_t count) noexcept {
    if (made_.size() <= count) {
        return;
    }
    try {
        bool isUndone = true;
        while (made_.size() > count) {
            isUndone = undo({made_.back()}, false).empty() && isUndone;
            made_.pop_back();
        }
        if (!isUndone) {
            leave(); // the next change reports it
        } else if (made_.empty()) {
            finish();
        } else {
            write(made_);
        }
    } catch (...) {
        leave(); // the next change tries again
    }
}

void OpenMoves::leave() noexcept {
    made_.clear();
    hasRecord_ = false;
}

void OpenMoves::stage() {
    if (adapter_ != nullptr) {
        for (auto const& group : made_) {
            adapter_->moveInSourceControl(forGit(group));
        }
    }
}

void OpenMoves::finish() noexcept {
    if (made_.empty() && std::exchange(hasRecord_, false)) {
        try {
            record_.remove();
        } catch (...) { // the next change finds that there is nothing left to do
        }
    }
}

bool OpenMoves::recover() {
    if (!hasUnfinished()) {
        return false;
    }
    auto const recorded = record_.read().value_or(RecordedMoves());
    auto const moves = inOneList(recorded.groups);
    bool const isDone = !moves.empty() && isCommitted(recorded);
    std::vector<Move> left;
    if (isDone) {
        complete(recorded);
    } else {
        left = undo(recorded.groups, true);
    }
    record_.remove();
    if (!moves.empty()) {
        recovered_ = {isDone ? RecoveredMoves::Outcome::Completed : RecoveredMoves::Outcome::RolledBack,
                      moves, std::move(left)};
    }
    return isDone;
}

std::optional<RecoveredMoves> OpenMoves::takeRecovered() {
    return std::exchange(recovered_, std::nullopt);
}

/// A definition that has changed may have been changed by another program. The last move decides then, since
/// no later one can have changed its paths. All files were moved before the definition was written.
bool OpenMoves::isCommitted(RecordedMoves const& moves) const {
    auto const& last = moves.groups.back().back();
    return moves.definition != definition_.state() && definition_.isInProject(last.to) &&
           !definition_.isInProject(last.from) && diskEntry(last.to);
}

/// Git's index is written once for all moves. If another program has changed it since, it does not contain
/// them yet if it contains a path that they left and that no later one has taken.
bool OpenMoves::isStaged(RecordedMoves const& moves) const {
    if (moves.index == indexState()) {
        return false;
    }
    std::set<Path> taken;
    std::vector<Path> left;
    for (auto group = moves.groups.rbegin(); group != moves.groups.rend(); ++group) {
        for (auto const& move : *group) {
            if (!taken.contains(move.from)) {
                left.push_back(move.from);
            }
        }
        for (auto const& move : *group) {
            taken.insert(move.to);
        }
    }
    return std::ranges::none_of(left, [this](Path const& path) { return adapter_->isTracked(path); });
}

/// @return the moves that cannot be undone, because something else is in the place of the file.
std::vector<Move> OpenMoves::undo(MoveGroups const& groups, bool isRecovery) const {
    std::vector<Move> left;
    for (auto group = groups.rbegin(); group != groups.rend(); ++group) {
        std::vector<Move> undone;
        for (auto move = group->rbegin(); move != group->rend(); ++move) {
            moveIfDue(reversed(*move)) ? undone.push_back(reversed(*move)) : left.push_back(*move);
        }
        definition_.followInOthers(undone, isRecovery);
    }
    return left;
}

void OpenMoves::complete(RecordedMoves const& moves) {
    if (adapter_ != nullptr && !isStaged(moves)) {
        git::GitAdapter::Batch batch(*adapter_);
        for (auto const& group : moves.groups) {
            adapter_->moveInSourceControl(forGit(group));
        }
        batch.publish();
    }
    definition_.complete(inOneList(moves.groups));
}

} // namespace project::session
