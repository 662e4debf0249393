#include "SyncScan.hpp"

#include <algorithm>
#include <functional>
#include <iterator>
#include <set>
#include <system_error>
#include <unordered_set>
#include <utility>

#include "FileAttachments.hpp"
#include "NewFiles.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/session/DiskFolder.hpp"

namespace project::session {

namespace {

std::vector<Path> pathsOf(std::vector<FoundFile> const& files) {
    std::vector<Path> result;
    result.reserve(files.size());
    std::ranges::transform(files, std::back_inserter(result), &FoundFile::path);
    return result;
}

bool hasContents(Path const& folder) {
    try {
        return !readDiskFolder(folder).empty();
    } catch (std::system_error const&) {
        return false;
    }
}

/// Chooses, of files that are gone, those that are removed. A folder is removed if nothing in it remains.
class Removal {
public:
    Removal(SyncRules const& rules, Path const& root) : rules_(rules), root_(root) {}

    /// Keeps a path, which may not be in the project, and so the folders above it.
    void keep(Path const& path) {
        for (auto folder = path; folder != root_ && kept_.insert(folder).second;) {
            folder = metadata::getParentFolder(folder);
        }
    }

    std::vector<FoundFile> of(std::vector<FoundFile> const& gone) {
        std::vector<FoundFile> result;
        for (auto file = gone.rbegin(); file != gone.rend(); ++file) { // contents before their folder
            auto const path = metadata::getRelativePath(root_, file->path);
            bool const isRemoved =
                !kept_.contains(file->path) && rules_.decide(path) && !rules_.hasAtOrBelow(path);
            if (isRemoved) {
                result.push_back(*file);
            } else {
                keep(file->path);
            }
        }
        std::ranges::reverse(result);
        return result;
    }

private:
    SyncRules const& rules_;
    Path const& root_;
    std::set<Path> kept_;
};

} // namespace

SyncScan::SyncScan(stores::TreeMetadataManager& store, Path const& root, git::GitAdapter& git)
    : store_(store), root_(root), git_(git), files_(store, root), rules_(readSyncRules(store, root), root) {
}

SyncPlan SyncScan::run() {
    for (auto const& folder : rules_.tops()) {
        compare(folder);
    }
    std::ranges::sort(plan_.added, std::less<>(), &FoundFile::path);
    findMissing();
    findAbsent();
    findLosses();
    return std::move(plan_);
}

void SyncScan::compare(std::u16string const& folder) {
    auto const path = absolute(folder);
    DiskComparison comparison(files_, root_);
    if (isFolderWithin(root_, path)) {
        comparison.run(path, {});
    } else {
        comparison.takeGone(path);
    }
    auto found = comparison.take();
    std::ranges::move(found.unreadable, std::back_inserter(plan_.unreadable));
    enterNew(std::move(found.added));
    remove(found.gone);
}

Path SyncScan::absolute(std::u16string const& path) const {
    return path.empty() ? root_ : root_ / Path(path);
}

void SyncScan::enterNew(std::vector<FoundFile> found) {
    auto added = filesOf(
        std::move(found),
        [this](std::vector<FoundFile> level) {
            std::erase_if(level, [this](FoundFile const& file) { return !isWanted(file); });
            return notIgnored(level);
        },
        plan_.unreadable);
    std::ranges::move(added, std::back_inserter(plan_.added));
}

/// Whether the patterns let a new file be added, or a new folder be entered.
bool SyncScan::isWanted(FoundFile const& file) const {
    auto const path = relative(file.path);
    auto const rule = rules_.decide(path);
    if (file.kind == FileKind::File) {
        return rule && rule->patterns.covers(rule->below);
    }
    return rules_.hasAtOrBelow(path) || (rule && !rule->patterns.excludes(rule->below));
}

/// Whether git decides about a new file or folder, too. A folder above a rule is entered in any case.
bool SyncScan::usesGit(FoundFile const& file) const {
    auto const path = relative(file.path);
    auto const rule = rules_.decide(path);
    return rule && rule->patterns.usesGitIgnore() &&
           (file.kind == FileKind::File || !rules_.hasAtOrBelow(path));
}

std::vector<FoundFile> SyncScan::notIgnored(std::vector<FoundFile> const& found) {
    std::vector<Path> asked;
    for (auto const& file : found) {
        if (usesGit(file)) {
            asked.push_back(file.path);
        }
    }
    auto const ignored = git_.ignored(asked);
    std::vector<FoundFile> result;
    std::ranges::copy_if(found, std::back_inserter(result),
                         [&ignored](FoundFile const& file) { return !ignored.contains(file.path); });
    return result;
}

/// Of the files that are gone, those that a sparse checkout left out stay, and so do folders in which git
/// tracks other files: removing a folder from the project removes these from git's index.
void SyncScan::remove(std::vector<FoundFile> const& gone) {
    auto const paths = pathsOf(gone);
    auto const leftOut = git_.leftOut(paths);
    Removal removal(rules_, root_);
    std::ranges::for_each(leftOut, [&removal](Path const& file) { removal.keep(file); });
    std::unordered_set<std::u16string> listed;
    std::vector<Path> folders;
    for (auto const& file : gone) {
        listed.insert(file.path.native());
        if (file.kind == FileKind::Folder) {
            folders.push_back(file.path);
        }
    }
    for (auto const& file : git_.trackedBelow(folders)) {
        if (!listed.contains(file.native())) {
            removal.keep(file);
        }
    }
    for (auto& file : removal.of(gone)) {
        plan_.removed.push_back({std::move(file), {}, {}});
    }
}

/// A folder that is not mounted is missing or empty.
void SyncScan::findMissing() {
    std::set<std::u16string> folders;
    for (auto const& removed : plan_.removed) {
        folders.emplace(rules_.decide(relative(removed.file.path))->folder);
    }
    for (auto const& folder : folders) {
        auto const path = absolute(folder);
        if (!isFolderWithin(root_, path) || !hasContents(path)) {
            plan_.missing.push_back(path);
        }
    }
}

void SyncScan::findAbsent() {
    for (auto const& rule : readSyncRules(store_, root_)) {
        bool const isMissing = std::ranges::find(plan_.missing, rule.folder) != plan_.missing.end();
        if (!isMissing && !isFolderWithin(root_, rule.folder)) {
            plan_.absent.push_back(rule.folder);
        }
    }
}

void SyncScan::findLosses() {
    if (plan_.removed.empty()) {
        return;
    }
    auto const entryPoints = entryPointNames(store_);
    for (auto& removed : plan_.removed) {
        if (auto const node = store_.getNode(files_.addressOf(removed.file.path))) {
            removed.labels = labelsOn(*node);
        }
        auto const [first, last] = entryPoints.equal_range(relative(removed.file.path));
        std::transform(first, last, std::back_inserter(removed.entryPoints),
                       [](auto const& entry) { return entry.second; });
    }
}

} // namespace project::session
