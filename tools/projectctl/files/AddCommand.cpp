#include <algorithm>
#include <iterator>
#include <string>
#include <vector>

#include "cli/PathArguments.hpp"
#include "files/Commands.hpp"
#include "files/DiskFolder.hpp"
#include "files/DiskWalk.hpp"
#include "git/GitIgnore.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/ProjectCommand.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// Adds files and folders, all in one step: either all of them are in the project afterwards, or none is.
class AddCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("add", "Add files and folders to the project");
        given_.declare(*app, "What to add");
        app->add_flag("-r,--recursive", recursive_,
                      "Add what folders contain, at any depth: not what source control or a project's store "
                      "keeps, no sockets, pipes and devices; symbolic links are added and not entered");
        app->add_flag("--gitignore", gitignore_, "Of what folders contain, leave out what git ignores")
            ->needs("--recursive");
        return app;
    }

    int run(OpenProject& project) override {
        auto paths = given_.read();
        add(project, paths);
        tellUnaddable();
        output().say(std::to_string(paths.size()) + " added to the project");
        return 0;
    }

private:
    /// @param paths becomes all that was added.
    void add(OpenProject& project, std::vector<Path>& paths) {
        Progress progress("Reading folders");
        auto contents = recursive_ ? contentsOf(paths, project, progress) : std::vector<Path>();
        std::erase(paths, project.root()); // in every project, and nothing to add
        paths.insert(paths.end(), std::make_move_iterator(contents.begin()),
                     std::make_move_iterator(contents.end()));
        progress.begin("Adding " + std::to_string(paths.size()) + " files and folders");
        project.files().add(paths);
        project.stageReturned(paths);
    }

    /// What the folders among the paths contain and the project does not have yet: what it has is not
    /// touched.
    std::vector<Path> contentsOf(std::vector<Path> const& paths, OpenProject& project, Progress& progress) {
        DiskWalk walk(project.root(), progress);
        auto const storeFolder = project.store().getMetadataRoot();
        for (auto const& path : paths) {
            // What cannot be added is not walked through: the file manager says why it cannot.
            if (isWithin(path, project.root()) && !isWithin(path, storeFolder) && isFolderItself(path)) {
                walk.enter(path);
            }
        }
        unaddable_ = walk.unaddable();
        auto result = walk.found();
        if (gitignore_) {
            progress.begin("Asking git what it ignores");
            result = withoutIgnoredByGit(project.root(), std::move(result));
        }
        requireReadable(walk.unreadable(), paths, result);
        auto const guard = project.store().acquireReadLock();
        std::erase_if(result, [&](Path const& path) { return project.files().isFileInProject(path); });
        return result;
    }

    static bool isWithin(Path const& path, Path const& folder) {
        return path == folder || project::metadata::isParent(path, folder);
    }

    void tellUnaddable() const {
        if (!unaddable_.empty()) {
            auto const others = unaddable_.size() - 1;
            printError("left out \"" + shown(unaddable_.front()) + '"' +
                       (others > 0 ? " and " + std::to_string(others) + " more" : "") +
                       ": a name that begins with two dots cannot be added from the project's root");
        }
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

    PathArguments given_;
    bool recursive_ = false;
    bool gitignore_ = false;
    std::vector<Path> unaddable_; ///< what was left out of the folders' contents
};

} // namespace

std::unique_ptr<Command> makeAddCommand() {
    return std::make_unique<AddCommand>();
}

} // namespace projectctl
