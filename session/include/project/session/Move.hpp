#pragma once

#include <string>
#include <vector>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "fl/filesystem/Path.hpp"
#include "project/session/Export.hpp"

namespace project::session {

/// A file or folder with its old and its new path, both absolute. A folder moves with everything below it.
struct Move {
    fl::filesystem::Path from; ///< the old path, absolute
    fl::filesystem::Path to;   ///< the new path, absolute

    friend bool operator==(Move const&, Move const&) = default;
};

/// The end of a move that a process did not finish, because it was killed or the power failed.
struct RecoveredMoves {
    /// How the move ended.
    enum class Outcome {
        Completed,  ///< the definition contained the new paths: git's index has them now as well
        RolledBack, ///< it did not: the files have their old paths again
    };

    Outcome outcome;         ///< how the moves ended
    std::vector<Move> moves; ///< all moves of the change

    /// Those whose files stay where they are, because another program has put something in their place.
    std::vector<Move> left;

    friend bool operator==(RecoveredMoves const&, RecoveredMoves const&) = default;
};

/// A move that is not possible. Nothing has changed.
///
/// Its text is in the language that fl::i18n::MessageCatalog has when the error is created: English, unless
/// the application chose another.
///
/// @ingroup errors
class PROJECT_SESSION_EXPORT MoveError : public computils::exception::StackTraceRecordingException {
public:
    /// The condition that is not met.
    enum class Reason {
        IsRoot,            ///< the project's own folder
        IsMissing,         ///< the file is not on disk
        IsNested,          ///< another file of the same move is a folder above it
        Exists,            ///< there is something at the new path on disk
        IsInProject,       ///< the new path is in the project already, or is that of two files
        LeavesProject,     ///< the new path is outside the project's folder
        EntersStore,       ///< the new path is in the store's own folder
        EntersItself,      ///< the new path is below the folder that would move
        HasNoFolder,       ///< there is no folder for the new path
        IsBeyondLink,      ///< a symbolic link is above the new path, so that it may be outside the project
        IsOtherFileSystem, ///< the new path is on another file system
        DiskFailed,        ///< a system call failed
    };

    /// @param problem of the system, for DiskFailed.
    MoveError(Reason reason, Move move, std::string problem = {});

    /// A sentence with both paths, in UTF-8.
    char const* what() const noexcept override { return text_.c_str(); }

    /// Returns the condition that is not met.
    Reason reason() const noexcept { return reason_; }

    /// Returns the move that is not possible.
    Move const& move() const noexcept { return move_; }

    /// Returns the text of the system, for DiskFailed.
    std::string const& problem() const noexcept { return problem_; }

private:
    Reason reason_;
    Move move_;
    std::string problem_;
    std::string text_;
};

} // namespace project::session
