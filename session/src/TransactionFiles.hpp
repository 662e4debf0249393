#pragma once

#include <functional>
#include <vector>

#include "project/cm/CMAwareProjectManager.hpp"
#include "project/session/Move.hpp"

namespace project::session {

using fl::filesystem::Path;

/// The files that an operation adds to the project or removes from it.
struct ChangedFiles {
    std::vector<Path> added{};
    std::vector<Path> removed{};
};

/// The files that the operations of a step have added and removed, so that source control gets those of the
/// commit, and not those of operations that were rolled back.
///
/// Used under the store's write guard.
class TransactionFiles {
public:
    using IsInProject = std::function<bool(Path const&)>;

    /// A number of files of both kinds.
    struct Mark {
        std::size_t added;
        std::size_t removed;
    };

    /// @param sourceControl borrowed; null if source control is off.
    /// @param isInProject whether a file is in the project at the moment.
    TransactionFiles(management::CMAwareProjectManager* sourceControl, IsInProject isInProject);

    Mark mark() const noexcept { return {files_.added.size(), files_.removed.size()}; }

    /// Adds the files of an operation that has returned.
    void add(ChangedFiles const& files);

    /// Follows moves on disk: a file that the step has added is to be added under its new path, and a path
    /// that was left is not removed any more if another file has it now.
    void move(std::vector<Move> const& moves);

    /// Drops the files since a mark: the operations were rolled back.
    void dropSince(Mark mark) noexcept;

    /// Begins a transaction. Files that wait for source control already are kept aside until its end.
    void beginTransaction();

    /// Passes the files of a transaction that is about to be committed to source control.
    void passToSourceControl();

    /// Lets only those files wait for source control that waited before the transaction: it was rolled back.
    void restoreEarlier() noexcept;

    /// Ends the outermost step.
    void clear() noexcept;

    /// The files that were added and not removed again. Ends the outermost step.
    std::vector<Path> takeAdded();

private:
    management::NotedFiles filtered() const;
    bool needsFiltering() const noexcept;
    std::vector<Path> addedInTheEnd() const;

    management::CMAwareProjectManager* sourceControl_;
    IsInProject isInProject_;
    ChangedFiles files_;
    bool hasDropped_ = false;
    management::NotedFiles earlier_; ///< noted before the transaction
};

} // namespace project::session
