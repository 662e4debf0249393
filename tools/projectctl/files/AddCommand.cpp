#include <algorithm>
#include <iterator>
#include <string>
#include <utility>
#include <vector>

#include "changes/DryRun.hpp"
#include "cli/PathArguments.hpp"
#include "files/Additions.hpp"
#include "files/Commands.hpp"
#include "files/DiskFolder.hpp"
#include "files/DiskWalk.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// Adds files and folders in one step: either all of them are in the project afterwards, or none is.
///
/// The file manager drops the labels of a file that is added again. This command therefore passes it only
/// paths that are not in the project yet, unless the user asks for the rest with --anew.
class AddCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("add");
        given_.declare(*app, Completes::NewPaths);
        app->add_flag("-r,--recursive", isRecursive_);
        app->add_flag("--gitignore", leavesOutIgnored_)->needs("--recursive");
        app->add_flag("--anew", addsAnew_);
        dryRun_.declare(*app);
        return app;
    }

    int run(OpenProject& project) override {
        auto const given = given_.read();
        Progress progress(Message("ProgressReadFolders"));
        auto const contents = isRecursive_ ? contentsOf(given, project, progress) : std::vector<Path>();
        add(project, given, contents, progress);
        return 0;
    }

private:
    void add(OpenProject& project, std::vector<Path> const& given, std::vector<Path> const& contents,
             Progress& progress) const {
        ProjectTransaction transaction(project);
        std::vector<Path> added;
        std::vector<Path> skipped;
        for (auto const& path : given) {
            if (path != project.root()) { // the root is part of every project
                bool const isSkipped = !addsAnew_ && project.files().isFileInProject(path);
                (isSkipped ? skipped : added).push_back(path);
            }
        }
        std::ranges::copy_if(contents, std::back_inserter(added),
                             [&](Path const& path) { return !project.files().isFileInProject(path); });
        progress.begin(Message("ProgressAdd", added.size()));
        project.access().addBelowLabelledFolders(added);
        project.stageReturnedLater(added);
        project.stageReturnedLater(skipped);
        project.changedFiles().listed += added.size();
        if (dryRun_.end(transaction, project)) {
            output().say(skipped.empty() ? Message("FilesAdded", added.size())
                                         : Message("FilesAddedOrSkipped", added.size(), skipped.size()));
        }
    }

    /// The contents of the given folders.
    std::vector<Path> contentsOf(std::vector<Path> const& given, OpenProject& project,
                                 Progress& progress) const {
        DiskWalk walk(project.root(), progress);
        auto const storeFolder = project.store().getMetadataRoot();
        for (auto const& path : given) {
            // A folder that cannot be added is not walked: the file manager reports why it cannot.
            if (isWithin(path, project.root()) && !isWithin(path, storeFolder) && isFolderItself(path)) {
                walk.enter(path);
            }
        }
        requireReadable(walk, given);
        return contentsToAdd(walk, project.root(), leavesOutIgnored_, progress);
    }

    static bool isWithin(Path const& path, Path const& folder) {
        return path == folder || project::metadata::isParent(path, folder);
    }

    PathArguments given_;
    bool isRecursive_ = false;
    bool leavesOutIgnored_ = false;
    bool addsAnew_ = false;
    DryRun dryRun_;
};

} // namespace

std::unique_ptr<Command> makeAddCommand() {
    return std::make_unique<AddCommand>();
}

} // namespace projectctl
