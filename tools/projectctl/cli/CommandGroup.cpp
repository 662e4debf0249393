#include "cli/CommandGroup.hpp"

#include <algorithm>
#include <cstddef>
#include <utility>

namespace projectctl {

CommandGroup::CommandGroup(std::string name, std::vector<std::unique_ptr<Command>> members)
    : name_(std::move(name)), members_(std::move(members)) {
}

CLI::App* CommandGroup::declare(CLI::App& tool) {
    auto* const app = tool.add_subcommand(name_);
    app->require_subcommand(1);
    declared_.reserve(members_.size());
    for (auto const& member : members_) {
        declared_.push_back(member->declare(*app));
        declared_.back()->group("HelpMembers");
    }
    return app;
}

std::unique_ptr<Command> CommandGroup::takeCalledMember() {
    auto const called =
        std::find_if(declared_.begin(), declared_.end(), [](auto* app) { return app->parsed(); });
    return std::move(members_[static_cast<std::size_t>(called - declared_.begin())]);
}

int CommandGroup::run() {
    return takeCalledMember()->run();
}

} // namespace projectctl
