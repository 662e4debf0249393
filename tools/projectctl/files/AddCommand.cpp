#include <algorithm>
#include <iterator>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "changes/DryRun.hpp"
#include "cli/PathArguments.hpp"
#include "cli/ShownPaths.hpp"
#include "files/Commands.hpp"
#include "files/DiskFolder.hpp"
#include "files/DiskWalk.hpp"
#include "git/GitIgnore.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "project/files/FileMetadataManager.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/stores/Node.hpp"

namespace projectctl {

namespace {

namespace fileSchema = project::metadata::schema::files;

/// Adds files and folders in one step: either all of them are in the project afterwards, or none is.
///
/// The file manager drops the labels of a file that is added again, and those of the folders above an added
/// file. This command therefore passes it only paths that are not in the project yet, unless the user asks
/// for the rest with --anew; and it restores the folders that the user did not name.
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
        Progress progress("Reading folders");
        auto const contents = isRecursive_ ? contentsOf(given, project, progress) : std::vector<Path>();
        reportUnaddable(project);
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
        progress.begin("Adding " + std::to_string(added.size()) + " files and folders");
        addBelowLabelledFolders(project, added);
        project.stageReturnedLater(added);
        project.stageReturnedLater(skipped);
        if (dryRun_.end(transaction, project)) {
            output().say(std::to_string(added.size()) + " added to the project" +
                         (skipped.empty() ? "" : ", " + std::to_string(skipped.size()) + " already in it"));
        }
    }

    /// Adds paths, and keeps the labels of the folders above them.
    void addBelowLabelledFolders(OpenProject& project, std::vector<Path> const& added) const {
        auto const fileList = project.files().getFileMetadataManagerFor(fileSchema::fileListScope);
        auto folders = labelledFoldersAbove(added, project.root(), *fileList);
        project.files().add(added);
        if (!folders.empty()) {
            fileList->setFileNodes(std::move(folders));
        }
    }

    using Nodes = std::map<Path, std::shared_ptr<project::metadata::MetadataNode>>;

    /// The folders above added paths that have labels, with their nodes. Folders that are added again
    /// themselves are not among them: the user asked for that.
    Nodes labelledFoldersAbove(std::vector<Path> const& added, Path const& root,
                               project::management::FileMetadataManager& fileList) const {
        std::set<Path> addedAgain;
        if (addsAnew_) {
            addedAgain.insert(added.begin(), added.end());
        }
        std::set<Path> visited;
        Nodes result;
        for (auto const& path : added) {
            auto folder = project::metadata::getParentFolder(path);
            while (project::metadata::isParent(folder, root) && visited.insert(folder).second) {
                if (!addedAgain.contains(folder) && fileList.hasFileNode(folder)) {
                    auto node = fileList.getFileNode(folder);
                    if (!project::metadata::isEqual(*node, *project::stores::plainNode())) {
                        result.emplace(folder, std::move(node));
                    }
                }
                folder = project::metadata::getParentFolder(folder);
            }
        }
        return result;
    }

    /// The contents of the given folders.
    std::vector<Path> contentsOf(std::vector<Path> const& given, OpenProject& project, Progress& progress) {
        DiskWalk walk(project.root(), progress);
        auto const storeFolder = project.store().getMetadataRoot();
        for (auto const& path : given) {
            // A folder that cannot be added is not walked: the file manager reports why it cannot.
            if (isWithin(path, project.root()) && !isWithin(path, storeFolder) && isFolderItself(path)) {
                walk.enter(path);
            }
        }
        unaddable_ = walk.unaddable();
        auto result = walk.found();
        if (leavesOutIgnored_) {
            progress.begin("Asking git for ignored files");
            result = withoutIgnoredByGit(project.root(), std::move(result));
        }
        requireReadable(walk.unreadable(), given, result);
        return result;
    }

    static bool isWithin(Path const& path, Path const& folder) {
        return path == folder || project::metadata::isParent(path, folder);
    }

    /// A folder that is not added need not be readable.
    static void requireReadable(std::vector<DiskWalk::Unreadable> const& unreadable,
                                std::vector<Path> const& given, std::vector<Path> const& found) {
        for (auto const& [folder, problem] : unreadable) {
            if (std::ranges::count(given, folder) + std::ranges::count(found, folder) > 0) {
                throw Failure(problem + "; nothing was added");
            }
        }
    }

    void reportUnaddable(OpenProject& project) const {
        if (!unaddable_.empty()) {
            std::size_t const others = unaddable_.size() - 1;
            printError("left out " + inQuotes(ShownPaths(project.root()).ofAbsolute(unaddable_.front())) +
                       (others > 0 ? " and " + std::to_string(others) + " more" : "") +
                       ": a name that begins with two dots cannot be added from the project's root");
        }
    }

    PathArguments given_;
    bool isRecursive_ = false;
    bool leavesOutIgnored_ = false;
    bool addsAnew_ = false;
    DryRun dryRun_;
    std::vector<Path> unaddable_; ///< left out of the contents of the folders
};

} // namespace

std::unique_ptr<Command> makeAddCommand() {
    return std::make_unique<AddCommand>();
}

} // namespace projectctl
