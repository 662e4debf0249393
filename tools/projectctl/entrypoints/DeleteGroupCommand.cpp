#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "entrypoints/GroupCommands.hpp"
#include "entrypoints/Groups.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

class DeleteGroupCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("delete");
        completes(takeText(*app, "GROUP", group_), Completes::EntryPointGroups)->required();
        return app;
    }

    int run(OpenProject& project) override {
        auto const guard = project.store().acquireWriteLock();
        auto& entryPoints = project.manager().getEntryPointManager();
        Groups const groups(entryPoints);
        auto const& group = groups.named(*group_);
        if (groups.isDefault(group)) {
            throw Failure(Message("DefaultGroup", group.getName()));
        }
        entryPoints.deleteEntryPointGroup(group);
        return 0;
    }

private:
    std::optional<std::string> group_;
};

} // namespace

std::unique_ptr<Command> makeDeleteGroupCommand() {
    return std::make_unique<DeleteGroupCommand>();
}

} // namespace projectctl
