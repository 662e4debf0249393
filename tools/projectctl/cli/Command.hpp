#pragma once

#include <memory>
#include <string_view>
#include <vector>

#include <CLI/CLI.hpp>

namespace projectctl {

/// A command of the tool: its name, its arguments, and its work. Each command has its own file; the header
/// Commands.hpp of each room lists those of the room.
///
/// Order of use: declare, then run, once, if the command line calls this command.
class Command {
public:
    virtual ~Command() = default;

    /// Adds the command and its options to the tool. The values of the options are stored in this object.
    /// @return the added command.
    virtual CLI::App* declare(CLI::App& tool) = 0;

    /// Does the work. Results are written to output(), which the caller flushes.
    /// @return the exit code: `done`, or `finding`.
    /// @throws std::exception whose text is the one line for the user.
    virtual int run() = 0;

    /// Of a group, removes and returns the member that the parsed command line calls; otherwise null.
    virtual std::unique_ptr<Command> takeCalledMember() { return nullptr; }

    /// Whether the command writes a listing, which a terminal shows in a pager.
    virtual bool isListing() const { return false; }
};

/// The purpose of a command that help does not show.
inline constexpr char const* hiddenPurpose = "";

/// A command by its name on the command line.
struct NamedCommand {
    std::string_view name;
    char const* purpose; ///< the message with the heading under which help shows it
    std::unique_ptr<Command> (*make)();
};

/// Commands in the order in which help shows them.
using CommandList = std::vector<NamedCommand>;

} // namespace projectctl
