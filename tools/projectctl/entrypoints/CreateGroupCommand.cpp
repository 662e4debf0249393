#include <optional>
#include <string>

#include "cli/TextArguments.hpp"
#include "entrypoints/GroupCommands.hpp"
#include "output/NameForms.hpp"
#include "project/ProjectCommand.hpp"
#include "project/entrypoints/EntryPointGroup.hpp"

namespace projectctl {

namespace {

class CreateGroupCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("create");
        takeText(*app, "NAME", name_)->required();
        return app;
    }

    int run(OpenProject& project) override {
        project::management::EntryPointGroupDefinition const group(textOf(*name_));
        project.manager().getEntryPointManager().createEntryPointGroup(group);
        return 0;
    }

private:
    std::optional<std::string> name_;
};

} // namespace

std::unique_ptr<Command> makeCreateGroupCommand() {
    return std::make_unique<CreateGroupCommand>();
}

} // namespace projectctl
