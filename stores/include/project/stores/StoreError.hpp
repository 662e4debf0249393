#pragma once

#include <cstddef>
#include <string>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "project/stores/Export.hpp"

namespace project::stores {

/// An operation of the store failed: the disk failed, the text is damaged, or another process holds the lock.
///
/// It is not a project::exception::ProjectException: managers drop some of those as stale data, and a failing
/// disk must never be mistaken for stale data.
///
/// The stores write the problem and the remedy in the language that fl::i18n::MessageCatalog has when the
/// error is created: English, unless the application chose another. The system's own texts stay as they are.
class PROJECT_STORES_EXPORT StoreError : public computils::exception::StackTraceRecordingException {
public:
    /// The reason, as far as a caller can act on it. With every kind except OutcomeUnknown, the batch of the
    /// failed operation is not in the project.
    enum class Kind {
        Refused,    ///< not possible with these arguments, in this process or with this version; do not retry
        Busy,       ///< another process holds the lock, or changed the project just now; retry
        Damaged,    ///< the text is unreadable or incomplete, or something else is in the place of a store's
                    ///< file
        Conflict,   ///< the text contains conflict markers
        DiskFailed, ///< a system call failed: no space, no permission, an input/output error
        Unreachable,   ///< the server of a shared project does not answer, or is starting; retry later
        OutcomeUnknown ///< the batch may be in the project or not; reopen the project and check
    };

    /// @param file the file or folder concerned, in UTF-8 as far as its name is; may be empty.
    /// @param line the line of the file, counted from 1; 0 if the error does not concern a line.
    /// @param problem the problem, as a clause without a full stop.
    /// @param remedy the action that solves the problem, as a sentence; may be empty.
    StoreError(Kind kind, std::string file, std::size_t line, std::string problem, std::string remedy);

    /// "file:line: problem. remedy", in UTF-8.
    char const* what() const noexcept override { return text_.c_str(); }

    /// Returns the kind, which says how a caller can react.
    Kind kind() const noexcept { return kind_; }

    /// Returns the file concerned, in the system's bytes, or the name of the log.
    std::string const& file() const noexcept { return file_; }

    /// Returns the line, counted from 1; 0 if the error has none.
    std::size_t line() const noexcept { return line_; }

    /// Returns the problem, as a clause without a full stop.
    std::string const& problem() const noexcept { return problem_; }

    /// Returns the action that solves the problem, as a sentence; may be empty.
    std::string const& remedy() const noexcept { return remedy_; }

private:
    Kind kind_;
    std::string file_;
    std::size_t line_;
    std::string problem_;
    std::string remedy_;
    std::string text_;
};

} // namespace project::stores
