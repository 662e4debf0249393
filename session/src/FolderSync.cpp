#include "FolderSync.hpp"

#include <algorithm>
#include <iterator>
#include <map>
#include <set>
#include <utility>
#include <vector>

#include "FileAddition.hpp"
#include "RenameSearch.hpp"
#include "SyncRules.hpp"
#include "SyncScan.hpp"
#include "project/core/FileManager.hpp"
#include "project/git/GitAdapter.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/session/DiskFolder.hpp"

namespace project::session {

using ZEPHRA::project::management::SyncFolderMissing;
using ZEPHRA::project::management::SyncFolderUnsuitable;

namespace {

using RuleNodes = std::map<Path, std::shared_ptr<metadata::MetadataNode>>;

/// The files that are gone and that nothing was paired with. Where a new file is in the place that a folder
/// would move one of them to, they are not the same file.
class UnlikeFiles {
public:
    UnlikeFiles(Path const& root, RenamesFound const& renames, SyncPlan const& plan) {
        for (auto const& removed : plan.removed) {
            if (removed.file.kind == FileKind::File) {
                gone_.insert(removed.file.path);
            }
        }
        for (auto const& rename : renames.pairs) {
            gone_.erase(root / Path(rename.from));
        }
        std::ranges::transform(plan.added, std::inserter(added_, added_.end()), &FoundFile::path);
    }

    bool wouldMoveWith(Move const& folder) const {
        return std::ranges::any_of(gone_, [&](Path const& file) {
            return metadata::isParent(file, folder.from) &&
                   added_.contains(folder.to / Path(metadata::getRelativePath(folder.from, file)));
        });
    }

private:
    std::set<Path> gone_;
    std::set<Path> added_;
};

} // namespace

FolderSync::FolderSync(Path const& root, git::GitEnvironment environment, stores::TreeMetadataManager& store,
                       management::ProjectManager& project, ChangeExecutor& executor, EventQueue& raised)
    : root_(root),
      environment_(environment),
      store_(store),
      project_(project),
      executor_(executor),
      raised_(raised) {
}

std::unique_ptr<management::FileMetadataManager> FolderSync::rules() {
    return project_.getFileManager().getFileMetadataManagerFor(metadata::schema::sync::rulesScope);
}

/// Runs a change of the rules, which has no event of its own.
void FolderSync::change(std::function<void()> const& operation) {
    executor_.execute([&] {
        operation();
        raised_.input()->dispatchMetadataChange();
    });
}

void FolderSync::set(SyncRule const& rule) {
    if (!isFolderWithin(root_, rule.folder)) {
        exception::raise(SyncFolderUnsuitable(rule.folder.native()));
    }
    change([&] { rules()->setFileNodes({{rule.folder, nodeOf(rule)}}); });
}

bool FolderSync::remove(Path const& folder) {
    auto const guard = store_.acquireWriteLock();
    RuleNodes below; // are removed with the rule, and stored again
    bool isFound = false;
    for (auto const& rule : readSyncRules(store_, root_)) {
        isFound = isFound || rule.folder == folder;
        if (metadata::isParent(rule.folder, folder)) {
            below.emplace(rule.folder, nodeOf(rule));
        }
    }
    if (isFound) {
        change([&] {
            rules()->removeFileNodes({folder});
            rules()->setFileNodes(std::move(below));
        });
    }
    return isFound;
}

SyncPlan FolderSync::plan() {
    // An adapter of its own: it changes nothing, and rules apply if the session does not use git, too.
    git::GitAdapter git(root_, environment_);
    auto const guard = store_.acquireReadLock();
    return SyncScan(store_, root_, git).run();
}

RenamesFound FolderSync::findRenames(RenameOptions const& options, Path const& writer) {
    git::GitAdapter git(root_, environment_);
    auto const guard = store_.acquireReadLock();
    return RenameSearch(store_, root_, git, writer).run(options);
}

std::vector<Move> FolderSync::followed(RenamesFound const& renames, SyncPlan const& plan) const {
    std::set<Path> concerned; // a rule follows with its folder
    for (auto const& rule : readSyncRules(store_, root_)) {
        concerned.insert(rule.folder);
    }
    for (auto const& file : plan.added) {
        concerned.insert(file.path);
    }
    for (auto const& removed : plan.removed) {
        concerned.insert(removed.file.path);
    }
    UnlikeFiles const unlike(root_, renames, plan);
    std::vector<Move> result;
    for (auto const& rename : renames.pairs) {
        Move move{root_ / Path(rename.from), root_ / Path(rename.to)};
        bool const isConcerned = concerned.contains(move.from) || concerned.contains(move.to);
        bool const isSure = rename.evidence != Rename::Evidence::Name &&
                            !(rename.kind == FileKind::Folder && unlike.wouldMoveWith(move));
        if (isConcerned && isSure) {
            result.push_back(std::move(move));
        }
    }
    return result;
}

void FolderSync::apply(SyncPlan const& plan, SyncOptions const& options) {
    if (!plan.missing.empty() && !options.removesMissingFolders) {
        exception::raise(SyncFolderMissing(plan.missing.front().native()));
    }
    auto& files = project_.getFileManager();
    if (!plan.removed.empty()) {
        std::vector<Path> removed;
        std::ranges::transform(plan.removed, std::back_inserter(removed),
                               [](RemovedFile const& each) { return each.file.path; });
        files.remove(removed);
    }
    if (!plan.added.empty()) {
        std::vector<Path> added;
        std::ranges::transform(plan.added, std::back_inserter(added), &FoundFile::path);
        addBelowLabelledFolders(added, files);
    }
}

} // namespace project::session
