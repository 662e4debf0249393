#pragma once

#include "cli/Command.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// A command on the project that contains the working folder. The text is staged after the command's work.
class ProjectCommand : public Command {
public:
    int run() final;

    /// Does the work, and leaves no guard of the store open. @return as Command::run.
    virtual int run(OpenProject& project) = 0;
};

} // namespace projectctl
