#pragma once

#include <string>

#include <CLI/CLI.hpp>

#include "project/ProjectTransaction.hpp"

namespace projectctl {

/// The option --dry-run of a command that changes the project in a transaction.
class DryRun {
public:
    static constexpr char const* option = "--dry-run";

    void declare(CLI::App& app);

    bool isOn() const noexcept { return isOn_; }

    /// Ends the transaction of the command: commits it, or, with the option, writes its changes as
    /// ChangeLines does and leaves it to be rolled back. A commit notes how git undoes it.
    /// @return whether it was committed.
    bool end(ProjectTransaction& transaction, OpenProject& project) const;

    /// Whether the command writes JSON.
    bool isJson() const noexcept { return isJson_; }

private:
    bool isOn_ = false;
    bool isJson_ = false;
};

} // namespace projectctl
