#pragma once

#include <exception>
#include <string>

#include "PlatformExport.hpp"
#include "foundation/core/diag/stacktrace_base.hpp"

namespace computils::exception {

/// An exception that carries the call stack of the place that raised it. A copy keeps the stack of the first
/// throw. what() stays that of std::exception; derived classes give their own.
class PROJECT_PLATFORM_EXPORT StackTraceRecordingException : public std::exception {
public:
    /// The stack is not recorded yet: whoever raises the exception calls getStackTrace().capture().
    explicit StackTraceRecordingException(std::u16string text = {});

    StackTraceRecordingException(StackTraceRecordingException const&) = default;
    StackTraceRecordingException& operator=(StackTraceRecordingException const&) = default;
    ~StackTraceRecordingException() override;

    /// A text besides what(); mostly empty.
    std::u16string const& getText() const noexcept { return text_; }

    foundation::core::diag::stacktrace_base& getStackTrace() noexcept { return stackTrace_; }

    foundation::core::diag::stacktrace_base const& getStackTrace() const noexcept { return stackTrace_; }

private:
    std::u16string text_;
    foundation::core::diag::stacktrace_base stackTrace_;
};

} // namespace computils::exception
