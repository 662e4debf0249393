#pragma once

#include <cstddef>
#include <string>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "project/stores/Export.hpp"

namespace project::stores {

/// The store cannot do what it was asked: its disk fails, its text is damaged, somebody else holds it.
///
/// It is no project::exception::ProjectException: managers drop some of those as stale data, and a failing
/// disk must never be taken for that.
class PROJECT_STORES_EXPORT StoreError : public computils::exception::StackTraceRecordingException {
public:
    /// @param file the file or folder that is meant, in UTF-8 as far as its name is; may be empty.
    /// @param line the line of the file, counted from 1; 0 when no line is meant.
    /// @param problem what is wrong, a clause without a full stop.
    /// @param remedy what to do about it, a sentence; may be empty.
    StoreError(std::string file, std::size_t line, std::string problem, std::string remedy);

    /// "file:line: problem. remedy", in UTF-8.
    char const* what() const noexcept override { return text_.c_str(); }

    std::string const& getFile() const noexcept { return file_; }

    std::size_t getLine() const noexcept { return line_; }

    std::string const& getProblem() const noexcept { return problem_; }

    std::string const& getRemedy() const noexcept { return remedy_; }

private:
    std::string file_;
    std::size_t line_;
    std::string problem_;
    std::string remedy_;
    std::string text_;
};

} // namespace project::stores
