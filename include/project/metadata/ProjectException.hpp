#pragma once

#include <exception>
#include <utility>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "foundation/core/except/Exception.hpp"
#include "project/metadata/Export.hpp"

namespace project::exception {

/// Everything that the library itself raises: catching this catches every error of the catalog. What the
/// store raises is something else and passes by.
class PROJECT_METADATA_EXPORT ProjectException : public computils::exception::StackTraceRecordingException {
public:
    ProjectException();
    ProjectException(ProjectException const&) = default;
    ProjectException& operator=(ProjectException const&) = default;
    ~ProjectException() override;
};

/// The exception that carries a message of class M, to catch it by.
template <class M>
using Raised = foundation::core::except::Exception<M, ProjectException, void>;

/// Throws the exception for a message, with the call stack of this moment.
///
/// Inside a handler the exception that is being handled goes along as its nested one: what is thrown then is
/// both Raised<M> and std::nested_exception.
/// @tparam M a class of project/metadata/Messages.hpp.
/// @throws Raised<M> always.
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
