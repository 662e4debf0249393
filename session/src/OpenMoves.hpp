#pragma once

#include <cstddef>
#include <functional>
#include <optional>

#include "MoveRecord.hpp"
#include "project/git/GitAdapter.hpp"
#include "project/session/Move.hpp"

namespace project::session {

/// The moves on disk of a change that is not finished: they are undone if it is rolled back, and git's index
/// follows them when it is committed.
///
/// Used under the store's write guard.
class OpenMoves {
public:
    /// What the moves have to know about the definition.
    struct Definition {
        std::function<bool(Path const&)> isInProject;

        /// A text that changes with every commit.
        std::function<std::string()> state;

        /// Lets other projects follow files that have moved on disk; perhaps once more, after a crash.
        std::function<void(std::vector<Move> const&, bool isRepeated)> followInOthers;

        /// Completes committed moves outside the definition.
        std::function<void(std::vector<Move> const&)> complete;
    };

    /// @param root of the project. @param storeFolder the store's folder. @param adapter null if source
    /// control is off. All borrowed.
    OpenMoves(Path const& root, Path const& storeFolder, git::GitAdapter* adapter, Definition definition);

    /// The number of groups of moves.
    std::size_t size() const noexcept { return made_.size(); }

    /// Moves files on disk, all of them or none. They are written down before.
    /// @throws MoveError or stores::StoreError.
    void make(std::vector<Move> const& moves);

    /// Undoes the last groups. A file whose old path is taken by now stays, and the record with it.
    /// @param count the number of groups to keep.
    void undoBehind(std::size_t count) noexcept;

    /// Lets the next change decide about the moves: it is unknown whether they were committed.
    void leave() noexcept;

    /// Changes git's index for the moves. @throws git::GitError
    void stage();

    /// The definition contains the moves now. The record stays, in case this process dies before it has
    /// staged everything.
    void commit() noexcept { made_.clear(); }

    /// Deletes the record of committed moves. Does nothing without one, or while moves are open.
    void finish() noexcept;

    /// Whether recover has something to do.
    bool hasUnfinished() const { return !hasRecord_ && record_.exists(); }

    /// Completes the moves of a process that has died, or rolls them back.
    /// @return whether they were completed, so that the text is to be staged.
    /// @throws git::GitError if git's index is locked; the next call tries again.
    bool recover();

    /// The result of recover since the last call.
    std::optional<RecoveredMoves> takeRecovered();

private:
    bool isCommitted(RecordedMoves const& moves) const;
    bool isStaged(RecordedMoves const& moves) const;
    void complete(RecordedMoves const& moves);
    std::vector<Move> undo(MoveGroups const& groups, bool isRecovery) const;
    void write(MoveGroups const& groups);
    std::string indexState() const;

    git::GitAdapter* adapter_;
    Definition definition_;
    MoveRecord record_;
    bool hasRecord_ = false; ///< of this object
    MoveGroups made_;
    std::optional<RecoveredMoves> recovered_;
};

} // namespace project::session
