#pragma once

#include "cli/Command.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// A command on a project.
///
/// The command does not open the project itself. run() opens the one that contains the working folder, for
/// this command alone; a batch passes the one project that it has opened to all its commands.
class ProjectCommand : public Command {
public:
    /// Opens the project, does the work, and then stages the text.
    int run() final;

    /// Does the work, and leaves no guard of the store open. @return as Command::run.
    virtual int run(OpenProject& project) = 0;

    /// Whether the command may run in a transaction together with others. False if it waits, asks the user,
    /// or changes the text other than through the store.
    virtual bool canRunInBatch() const { return true; }
};

} // namespace projectctl
