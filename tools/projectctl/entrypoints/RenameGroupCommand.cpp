#include <optional>
#include <string>

#include "cli/Completes.hpp"
#include "cli/TextArguments.hpp"
#include "entrypoints/GroupCommands.hpp"
#include "entrypoints/Groups.hpp"
#include "output/NameForms.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

class RenameGroupCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("rename");
        completes(takeText(*app, "GROUP", group_), Completes::EntryPointGroups)->required();
        takeText(*app, "NAME", name_)->required();
        return app;
    }

    int run(OpenProject& project) override {
        auto const guard = project.store().acquireWriteLock();
        auto& entryPoints = project.manager().getEntryPointManager();
        entryPoints.renameEntryPointGroup(Groups(entryPoints).named(*group_), textOf(*name_));
        return 0;
    }

private:
    std::optional<std::string> group_;
    std::optional<std::string> name_;
};

} // namespace

std::unique_ptr<Command> makeRenameGroupCommand() {
    return std::make_unique<RenameGroupCommand>();
}

} // namespace projectctl
