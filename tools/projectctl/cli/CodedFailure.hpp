#pragma once

#include "cli/ExitCode.hpp"
#include "output/Failure.hpp"

namespace projectctl {

/// An error with an exit code of its own.
class CodedFailure : public Failure {
public:
    CodedFailure(Message const& message, int exitCode) : Failure(message), exitCode_(exitCode) {}

    int exitCode() const noexcept { return exitCode_; }

private:
    int exitCode_;
};

/// Arguments or commands that cannot be parsed, or that cannot be combined.
class WrongUse : public CodedFailure {
public:
    explicit WrongUse(Message const& message) : CodedFailure(message, exit_code::wrongUse) {}
};

} // namespace projectctl
