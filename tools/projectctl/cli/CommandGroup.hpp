#pragma once

#include <memory>
#include <string>
#include <vector>

#include "cli/Command.hpp"

namespace projectctl {

/// Commands on one subject, called by the name of the subject and their own: `projectctl category rename`.
class CommandGroup : public Command {
public:
    /// @param members the commands, in the order in which help shows them.
    CommandGroup(std::string name, std::vector<std::unique_ptr<Command>> members);

    CLI::App* declare(CLI::App& tool) override;
    std::unique_ptr<Command> takeCalledMember() override;
    int run() override;

private:
    std::string name_;
    std::vector<std::unique_ptr<Command>> members_;
    std::vector<CLI::App*> declared_; ///< one per member
};

} // namespace projectctl
