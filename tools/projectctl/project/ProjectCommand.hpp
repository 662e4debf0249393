#pragma once

#include "cli/Command.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// A command that works on the project that the working folder lies in. What it has changed is staged when it
/// is done.
class ProjectCommand : public Command {
public:
    int run() final;

    /// Does the work. No guard of the store outlives it. @return as Command::run.
    virtual int run(OpenProject& project) = 0;
};

} // namespace projectctl
