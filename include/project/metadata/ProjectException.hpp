#pragma once

#include <exception>
#include <utility>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "foundation/core/except/Exception.hpp"
#include "project/metadata/Export.hpp"

namespace project::exception {

/// The base of all errors of the catalog. The store's own errors do not derive from it: a handler for stale
/// data must not catch a failing disk.
class PROJECT_METADATA_EXPORT ProjectException : public computils::exception::StackTraceRecordingException {
public:
    ProjectException();
    ProjectException(ProjectException const&) = default;
    ProjectException& operator=(ProjectException const&) = default;
    ~ProjectException() override;
};

/// The exception with a message of class M, for use in catch clauses.
template <class M>
using Raised = foundation::core::except::Exception<M, ProjectException, void>;

/// Throws the exception for a message and records the current call stack.
///
/// Inside a catch block, the current exception is nested in the new one: the thrown object is then both a
/// Raised<M> and a std::nested_exception.
/// @tparam M a class of project/metadata/Messages.hpp.
/// @throws Raised<M>, always.
template <class M>
[[noreturn]] void raise(M const& message) {
    ProjectException base;
    base.getStackTrace().capture(0);
    Raised<M> error(base, message);
    if (std::current_exception()) {
        std::throw_with_nested(std::move(error));
    }
    throw error;
}

} // namespace project::exception
