#include <string>
#include <vector>

#include "changes/DryRun.hpp"
#include "cli/PathArguments.hpp"
#include "cli/ShownPaths.hpp"
#include "files/Commands.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// Removes files and folders from the project in one step. The files stay on disk.
class RemoveCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("remove");
        paths_.declare(*app);
        dryRun_.declare(*app);
        return app;
    }

    int run(OpenProject& project) override {
        auto const paths = paths_.read();
        ProjectTransaction transaction(
            project); // first: the checks read the state in which the files are removed
        requireWithinRoot(project, paths);
        warnOfTrackedFiles(project, paths);
        Progress const progress(Message("ProgressRemove", paths.size()));
        auto const removed = project.files().remove(paths);
        project.changedFiles().listed += removed.size();
        if (dryRun_.end(transaction, project)) {
            output().say(Message("FilesRemoved", removed.size()));
        }
        return 0;
    }

private:
    /// A text that another person wrote may list files outside the root. Removing such a file from the
    /// project would also remove it from git's index, where it belongs to another part of the repository.
    static void requireWithinRoot(OpenProject& project, std::vector<Path> const& paths) {
        auto const isOutside = [&project](Path const& path) {
            return path != project.root() && !project::metadata::isParent(path, project.root());
        };
        auto const guard = project.store().acquireReadLock();
        for (auto const& path : paths) {
            if (isOutside(path) && project.files().isFileInProject(path)) {
                throw Failure(Message("FileOutside", shown(path)));
            }
        }
    }

    static void warnOfTrackedFiles(OpenProject& project, std::vector<Path> const& paths) {
        ShownPaths shown(project.root());
        for (auto const& path : project.trackedOutsideProject(paths)) {
            printWarning(Message("TrackedBelowRemoved", shown.ofAbsolute(path)));
        }
    }

    PathArguments paths_;
    DryRun dryRun_;
};

} // namespace

std::unique_ptr<Command> makeRemoveCommand() {
    return std::make_unique<RemoveCommand>();
}

} // namespace projectctl
