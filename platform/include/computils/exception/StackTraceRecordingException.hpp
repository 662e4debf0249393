#pragma once

#include <exception>
#include <string>

#include "PlatformExport.hpp"
#include "foundation/core/diag/stacktrace_base.hpp"

namespace computils::exception {

/// An exception with the call stack of the place that threw it. A copy has the same call stack. what() is
/// that of std::exception; derived classes override it.
class PROJECT_PLATFORM_EXPORT StackTraceRecordingException : public std::exception {
public:
    /// Does not record the call stack: the code that throws calls getStackTrace().capture().
    explicit StackTraceRecordingException(std::u16string text = {});

    StackTraceRecordingException(StackTraceRecordingException const&) = default;
    StackTraceRecordingException& operator=(StackTraceRecordingException const&) = default;
    ~StackTraceRecordingException() override;

    /// Returns a text besides what(), which is usually empty.
    std::u16string const& getText() const noexcept { return text_; }

    /// The stack of the thread that created the exception.
    foundation::core::diag::stacktrace_base& getStackTrace() noexcept { return stackTrace_; }

    /// The same.
    foundation::core::diag::stacktrace_base const& getStackTrace() const noexcept { return stackTrace_; }

private:
    std::u16string text_;
    foundation::core::diag::stacktrace_base stackTrace_;
};

} // namespace computils::exception
