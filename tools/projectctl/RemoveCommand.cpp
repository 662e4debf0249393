#include "Commands.hpp"
#include "Output.hpp"
#include "PathArguments.hpp"
#include "Progress.hpp"
#include "ProjectCommand.hpp"
#include "ProjectFolder.hpp"

namespace projectctl {

namespace {

/// Takes files and folders out of the project, all in one step, and leaves the disk alone.
class RemoveCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand(
            "remove",
            "Remove files, and folders with all that is in the project below them, from the project: "
            "with their labels, data and entry points. The files stay on disk");
        paths_.declare(*app, "What to remove");
        return app;
    }

    int run(OpenProject& project) override {
        auto const paths = paths_.read();
        for (auto const& path : project.trackedOutsideProject(paths)) {
            printError("warning: \"" + shown(path) +
                       "\" is below a removed folder and not in the project; git will not track it any more");
        }
        Progress const progress("Removing " + std::to_string(paths.size()) + " files and folders");
        auto const removed = project.files().remove(paths);
        output().say(std::to_string(removed.size()) + " removed from the project");
        return 0;
    }

private:
    PathArguments paths_;
};

} // namespace

std::unique_ptr<Command> makeRemoveCommand() {
    return std::make_unique<RemoveCommand>();
}

} // namespace projectctl
