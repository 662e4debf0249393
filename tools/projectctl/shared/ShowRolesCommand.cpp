#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "output/Failure.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/SharedServer.hpp"
#include "project/stores/SystemDisk.hpp"
#include "shared/SharedCommands.hpp"

namespace projectctl {

namespace {

using project::stores::TextBackend;

/// Shows the roles of the project, and the users that have them.
class ShowRolesCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("roles");
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        requireLog(project);
        auto const disk = project::stores::makeSystemDisk(project.root(), TextBackend::folderName);
        auto const location = project::stores::readSharedLocation(*disk);
        auto const server = project::stores::connectTo(location->kind, location->service);
        auto const projects = server->list();
        auto const found =
            std::ranges::find(projects, location->project, &project::stores::SharedProject::id);
        if (found == projects.end()) {
            throw Failure(Message("ProjectNotOnServer"));
        }
        JsonRows rows(json::sharedRoles, "roles");
        for (auto const& [right, role] :
             {std::pair("reader", found->reader), std::pair("writer", found->writer)}) {
            auto const members = server->members(role);
            isJson_ ? add(rows, right, role, members) : show(right, role, members);
        }
        if (isJson_) {
            rows.finish();
        }
        return 0;
    }

    bool canRunInBatch() const override { return false; }

private:
    using Names = std::vector<std::string>;

    static void add(JsonRows& rows, char const* right, std::string const& role, Names const& members) {
        std::vector<std::u16string> names(members.size());
        std::ranges::transform(members, names.begin(), textOf);
        rows.begin();
        rows.addText("right", textOf(right));
        rows.addText("role", textOf(role));
        rows.addList("members", names);
    }

    static void show(char const* right, std::string const& role, Names const& members) {
        output().text() += std::string(right) + '\t' + role;
        for (auto const& member : members) {
            output().text() += '\t' + member;
        }
        output().text() += '\n';
    }

    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeSharedRolesCommand() {
    return std::make_unique<ShowRolesCommand>();
}

} // namespace projectctl
