#pragma once

#include <string>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "project/git/Export.hpp"

namespace project::git {

/// Source control cannot do what it was asked: the index is locked or can't be written, a file would have to
/// go through a program first, the repository belongs to somebody else.
///
/// It is no error of the project itself: managers drop some of those as stale data, and a failing repository
/// must never be taken for that.
class PROJECT_GIT_EXPORT GitError : public computils::exception::StackTraceRecordingException {
public:
    /// @param file the file or folder that is meant, in the system's bytes; may be empty.
    /// @param problem what is wrong, a clause without a full stop.
    /// @param remedy what to do about it, a sentence; may be empty.
    GitError(std::string file, std::string problem, std::string remedy);

    /// "file: problem. remedy".
    char const* what() const noexcept override { return text_.c_str(); }

    std::string const& getFile() const noexcept { return file_; }

    std::string const& getProblem() const noexcept { return problem_; }

    std::string const& getRemedy() const noexcept { return remedy_; }

private:
    std::string file_;
    std::string problem_;
    std::string remedy_;
    std::string text_;
};

} // namespace project::git
