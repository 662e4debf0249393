#pragma once

#include <string>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "project/git/Export.hpp"

namespace project::git {

/// An operation of source control failed: the index is locked or cannot be written, a file needs a filter
/// program, the repository belongs to another user.
///
/// It is not a project::exception::ProjectException: managers drop some of those as stale data, and a failing
/// repository must never be mistaken for stale data.
///
/// The adapter writes the problem and the remedy in the language that fl::i18n::MessageCatalog has when the
/// error is created: English, unless the application chose another. The texts of libgit2 stay as they are.
class PROJECT_GIT_EXPORT GitError : public computils::exception::StackTraceRecordingException {
public:
    /// The reason, as far as a caller can act on it. With every kind, the index is unchanged.
    enum class Kind {
        Refused, ///< git itself has to do it, or has to be configured first; do not retry
        Busy,    ///< another process holds the lock of the index; retry
        Failed   ///< the repository or a file cannot be read or written
    };

    /// @param file the file or folder concerned, in the system's bytes; may be empty.
    /// @param problem the problem, as a clause without a full stop.
    /// @param remedy the action that solves the problem, as a sentence; may be empty.
    GitError(Kind kind, std::string file, std::string problem, std::string remedy);

    /// "file: problem. remedy".
    char const* what() const noexcept override { return text_.c_str(); }

    /// Returns the reason.
    Kind kind() const noexcept { return kind_; }

    /// Returns the file or folder concerned, in the system's bytes; may be empty.
    std::string const& file() const noexcept { return file_; }

    /// Returns the problem, as a clause without a full stop.
    std::string const& problem() const noexcept { return problem_; }

    /// Returns the action that solves the problem, as a sentence; may be empty.
    std::string const& remedy() const noexcept { return remedy_; }

private:
    Kind kind_;
    std::string file_;
    std::string problem_;
    std::string remedy_;
    std::string text_;
};

} // namespace project::git
