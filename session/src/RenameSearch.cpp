#include "RenameSearch.hpp"

#include <algorithm>
#include <functional>
#include <iterator>
#include <utility>

#include "DiskComparison.hpp"
#include "DiskEntries.hpp"
#include "FileTree.hpp"
#include "NewFiles.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace project::session {

RenameSearch::RenameSearch(stores::TreeMetadataManager& store, Path const& root, git::GitAdapter& git,
                           Path writer)
    : store_(store), root_(root), git_(git), writer_(std::move(writer)) {
}

RenamesFound RenameSearch::run(RenameOptions const& options) {
    usesGit_ = options.usesGit;
    compareWithDisk();
    if (!goneFiles_.empty() && !added_.empty()) {
        pairByContents(options.similarity);
        pairByNames();
    }
    FileTree const files(store_, root_);
    pairFolders(result_, goneFolders_, [this, &files](std::u16string const& path) {
        return static_cast<bool>(store_.getNode(files.addressOf(root_ / Path(path))));
    });
    return std::move(result_);
}

void RenameSearch::compareWithDisk() {
    FileTree const files(store_, root_);
    DiskComparison comparison(files, root_);
    comparison.run(root_, {});
    auto found = comparison.take();
    takeGone(found.gone);
    if (goneFiles_.empty()) {
        return;
    }
    std::vector<UnreadableFolder> unreadable; // have no files that can be read
    auto const added = filesOf(
        std::move(found.added), [this](auto level) { return withoutIgnored(std::move(level)); }, unreadable);
    std::ranges::transform(added, std::back_inserter(added_), &FoundFile::path);
    std::ranges::sort(added_, std::less<>());
}

std::vector<FoundFile> RenameSearch::withoutIgnored(std::vector<FoundFile> found) {
    if (usesGit_) {
        std::vector<Path> paths;
        std::ranges::transform(found, std::back_inserter(paths), &FoundFile::path);
        auto const ignored = git_.ignored(paths);
        std::erase_if(found, [&ignored](FoundFile const& file) { return ignored.contains(file.path); });
    }
    return found;
}

/// A file that a sparse checkout left out is not gone.
void RenameSearch::takeGone(std::vector<FoundFile> const& gone) {
    for (auto const& file : gone) {
        if (file.kind == FileKind::Folder) {
            goneFolders_.push_back(relative(file.path));
        } else {
            goneFiles_.push_back(file.path);
        }
    }
    if (usesGit_) {
        auto const leftOut = git_.leftOut(goneFiles_);
        std::erase_if(goneFiles_, [&leftOut](Path const& file) { return leftOut.contains(file); });
    }
}

void RenameSearch::pairByContents(int similarity) {
    if (usesGit_) {
        before_ = git_.earlierContents(goneFiles_, writer_);
    }
    if (before_.empty()) {
        return;
    }
    auto const after = git_.contentsOnDisk(added_);
    auto const empty = emptyOf(after);
    auto paired = pairByContent(idsOf(before_, empty), idsOf(after, empty));
    add(std::move(paired.renames));
    if (similarity < 100) {
        pairSimilar(paired, similarity);
    }
}

void RenameSearch::pairSimilar(PairedFiles const& rest, int similarity) {
    std::vector<std::string> before;
    std::ranges::transform(rest.gone, std::back_inserter(before), &FileContentId::id);
    std::vector<Path> onDisk;
    std::ranges::transform(rest.added, std::back_inserter(onDisk),
                           [this](FileContentId const& file) { return root_ / Path(file.path); });
    add(pairBySimilarity(rest.gone, rest.added, git_.similarContents(before, onDisk, similarity),
                         similarity));
}

/// Pairs the files whose earlier content is unknown with those that nothing else was paired with.
void RenameSearch::pairByNames() {
    std::vector<std::u16string> unknown;
    for (auto const& file : goneFiles_) {
        if (!before_.contains(file)) {
            unknown.push_back(relative(file));
        }
    }
    std::set<std::u16string> taken;
    for (auto const& pair : result_.pairs) {
        taken.insert(pair.to);
    }
    std::vector<std::u16string> rest;
    for (auto const& file : added_) {
        if (auto path = relative(file); !taken.contains(path)) {
            rest.push_back(std::move(path));
        }
    }
    add(pairByName(unknown, rest));
}

void RenameSearch::add(RenamesFound found) {
    std::ranges::move(found.pairs, std::back_inserter(result_.pairs));
    std::ranges::move(found.ambiguous, std::back_inserter(result_.ambiguous));
    sortByPath(result_.pairs);
}

std::vector<FileContentId> RenameSearch::idsOf(Contents const& contents,
                                               std::set<std::string> const& empty) const {
    std::vector<FileContentId> result;
    for (auto const& [file, id] : contents) {
        result.push_back({relative(file), id, empty.contains(id)});
    }
    return result;
}

/// The identities of empty contents.
std::set<std::string> RenameSearch::emptyOf(Contents const& onDisk) const {
    std::set<std::string> result;
    for (auto const& [file, id] : onDisk) {
        if (auto const entry = diskEntry(file); entry && entry->st_size == 0) {
            result.insert(id);
        }
    }
    return result;
}

std::u16string RenameSearch::relative(Path const& path) const {
    return metadata::getRelativePath(root_, path);
}

} // namespace project::session
