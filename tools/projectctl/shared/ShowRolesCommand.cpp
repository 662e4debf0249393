#include <algorithm>
#include <string>

#include "output/Failure.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/SharedServer.hpp"
#include "project/stores/SystemDisk.hpp"
#include "shared/SharedCommands.hpp"

namespace projectctl {

namespace {

using project::stores::SharedServer;
using project::stores::TextBackend;

/// Shows the roles of the project, and the users that have them.
class ShowRolesCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override { return tool.add_subcommand("roles"); }

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
        show("reader", found->reader, *server);
        show("writer", found->writer, *server);
        return 0;
    }

    bool canRunInBatch() const override { return false; }

private:
    static void show(char const* kind, std::string const& role, SharedServer const& server) {
        output().text() += std::string(kind) + '\t' + role;
        for (auto const& member : server.members(role)) {
            output().text() += '\t' + member;
        }
        output().text() += '\n';
    }
};

} // namespace

std::unique_ptr<Command> makeSharedRolesCommand() {
    return std::make_unique<ShowRolesCommand>();
}

} // namespace projectctl
