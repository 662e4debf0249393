#include <string>
#include <vector>

#include "cli/PathArguments.hpp"
#include "files/Commands.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "project/metadata/MetadataFunctions.hpp"

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
        requireWithin(project, paths);
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
    /// A text that somebody else made may list what lies outside the project. Git would take that out of its
    /// own list too, where it belongs to another part of the repository.
    static void requireWithin(OpenProject& project, std::vector<Path> const& paths) {
        auto const isOutside = [&project](Path const& path) {
            return path != project.root() && !project::metadata::isParent(path, project.root());
        };
        auto const guard = project.store().acquireReadLock();
        for (auto const& path : paths) {
            if (isOutside(path) && project.files().isFileInProject(path)) {
                throw Failure(
                    '"' + shown(path) +
                    "\" lies outside the project's folder; nothing was removed. Take its line out of "
                    "the project's text in an editor.");
            }
        }
    }

    PathArguments paths_;
};

} // namespace

std::unique_ptr<Command> makeRemoveCommand() {
    return std::make_unique<RemoveCommand>();
}

} // namespace projectctl
