#pragma once

#include <CLI/CLI.hpp>

namespace projectctl {

/// One command of the tool: what it is called, what it takes, and what it does. Each stands in a file of its
/// own; Commands.hpp lists them.
///
/// The order of use: declare, then, if it is the one that was called for, run.
class Command {
public:
    virtual ~Command() = default;

    /// Adds the command to the tool's, with its options, which are kept in this object.
    /// @return what was added.
    virtual CLI::App* declare(CLI::App& tool) = 0;

    /// Does the work. What is to be seen goes to output(), which the caller flushes.
    /// @return the exit code: 0, or 1 for bad news that are no error.
    /// @throws std::exception with the one line that tells what went wrong.
    virtual int run() = 0;
};

} // namespace projectctl
