#include "entrypoints/GroupCommands.hpp"
#include "entrypoints/Groups.hpp"
#include "output/JsonRows.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

class ListGroupsCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("list");
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        Groups const groups(project.manager().getEntryPointManager());
        isJson_ ? writeJson(groups) : writeLines(groups);
        return 0;
    }

    bool isListing() const override { return true; }

private:
    static void writeLines(Groups const& groups) {
        for (auto const& group : groups.all()) {
            output().name(group->getName());
            output().text() += '\n';
        }
    }

    static void writeJson(Groups const& groups) {
        JsonRows rows(json::groupList, "groups");
        for (auto const& group : groups.all()) {
            rows.begin();
            rows.addText("name", group->getName());
            rows.addText("uuid", group->getUUID());
        }
        rows.finish();
    }

    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeListGroupsCommand() {
    return std::make_unique<ListGroupsCommand>();
}

} // namespace projectctl
