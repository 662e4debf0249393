#include "files/Additions.hpp"

#include <algorithm>
#include <string>
#include <utility>

#include "cli/Settings.hpp"
#include "cli/ShownPaths.hpp"
#include "git/GitIgnore.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectTransaction.hpp"

namespace projectctl {

namespace {

/// Says on standard error which paths the project cannot contain.
void reportUnaddable(DiskWalk const& walk, Path const& root) {
    auto const& unaddable = walk.unaddable();
    if (!unaddable.empty()) {
        std::u16string const first(ShownPaths(root).ofAbsolute(unaddable.front()));
        std::size_t const others = unaddable.size() - 1;
        printError(others > 0 ? Message("LeftOutMore", first, others) : Message("LeftOut", first));
    }
}

} // namespace

void requireReadable(DiskWalk const& walk, std::vector<Path> const& paths) {
    for (auto const& [folder, problem] : walk.unreadable()) {
        if (std::ranges::count(paths, folder) > 0) {
            throw Failure(Message("NothingAdded", problem));
        }
    }
}

std::vector<Path> contentsToAdd(DiskWalk const& walk, Path const& root, bool leavesOutIgnored,
                                Progress& progress) {
    auto found = walk.found();
    if (leavesOutIgnored) {
        progress.begin(Message("ProgressIgnored"));
        found = withoutIgnoredByGit(root, std::move(found));
    }
    requireReadable(walk, found);
    reportUnaddable(walk, root);
    return found;
}

std::size_t addWholeTree(OpenProject& project) {
    auto const& root = project.root();
    Progress progress(Message("ProgressReadFolders"));
    DiskWalk walk(root, progress);
    walk.enter(root);
    bool const leavesOutIgnored = settings().sourceControl && isInGitRepository(root);
    auto const found = contentsToAdd(walk, root, leavesOutIgnored, progress);
    progress.begin(Message("ProgressAdd", found.size()));
    ProjectTransaction transaction(project);
    project.files().add(found);
    project.stageReturnedLater(found);
    transaction.commit();
    return found.size();
}

} // namespace projectctl
