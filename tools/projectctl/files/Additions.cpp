#include "files/Additions.hpp"

#include <algorithm>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <utility>

#include "cli/Settings.hpp"
#include "cli/ShownPaths.hpp"
#include "git/GitIgnore.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectTransaction.hpp"
#include "project/files/FileMetadataManager.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/stores/Node.hpp"

namespace projectctl {

namespace {

namespace fileSchema = project::metadata::schema::files;

using Nodes = std::map<Path, std::shared_ptr<project::metadata::MetadataNode>>;

/// The folders above added paths that have labels, with their nodes. Folders that are added again themselves
/// are not among them.
class LabelledFolders {
public:
    LabelledFolders(std::vector<Path> const& added, project::management::FileMetadataManager& fileList)
        : added_(added), fileList_(fileList) {}

    Nodes above(Path const& root) {
        std::set<Path> visited;
        for (auto const& path : added_) {
            auto folder = project::metadata::getParentFolder(path);
            while (project::metadata::isParent(folder, root) && visited.insert(folder).second) {
                take(folder);
                folder = project::metadata::getParentFolder(folder);
            }
        }
        return std::move(result_);
    }

private:
    void take(Path const& folder) {
        if (!fileList_.hasFileNode(folder)) {
            return;
        }
        auto node = fileList_.getFileNode(folder);
        if (!project::metadata::isEqual(*node, *project::stores::plainNode()) && !isAdded(folder)) {
            result_.emplace(folder, std::move(node));
        }
    }

    bool isAdded(Path const& folder) {
        if (!sorted_) {
            sorted_.emplace(added_.begin(), added_.end());
        }
        return sorted_->contains(folder);
    }

    std::vector<Path> const& added_;
    project::management::FileMetadataManager& fileList_;
    std::optional<std::set<Path>> sorted_; ///< of the added paths, when first needed
    Nodes result_;
};

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

void addBelowLabelledFolders(OpenProject& project, std::vector<Path> const& added) {
    auto const fileList = project.files().getFileMetadataManagerFor(fileSchema::fileListScope);
    auto folders = LabelledFolders(added, *fileList).above(project.root());
    project.files().add(added);
    if (!folders.empty()) {
        fileList->setFileNodes(std::move(folders));
    }
}

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
