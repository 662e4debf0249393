#pragma once

#include <string>
#include <vector>

#include "project/git/SimilarContent.hpp"
#include "project/session/Renames.hpp"

namespace project::session {

/// A path, relative to the project's root, and the identity of the content there. Contents with the same
/// identity are equal.
struct FileContentId {
    std::u16string path;
    std::string id;
    bool isEmpty = false; ///< the content says nothing: only files of the same name are paired
};

/// The pairs of files, and the files that were not paired.
struct PairedFiles {
    RenamesFound renames;
    std::vector<FileContentId> gone;
    std::vector<FileContentId> added;
};

/// Pairs files with equal contents. Where several files have the same content, those are paired that have
/// more of the end of their paths in common with each other than with any other file, at least their name.
/// The others are ambiguous.
PairedFiles pairByContent(std::vector<FileContentId> gone, std::vector<FileContentId> added);

/// Pairs files with similar contents, as git does: first those of the same name if no other file has it and
/// they are far more similar than they need to be, then the most similar ones. Where a file that remains is
/// as similar to one of a pair as the other one of it, all of them are ambiguous.
/// @param similar the similarities, by the positions of the files.
/// @param similarity the least one, in percent.
RenamesFound pairBySimilarity(std::vector<FileContentId> const& gone, std::vector<FileContentId> const& added,
                              std::vector<git::SimilarContent> similar, int similarity);

/// Pairs files by their names alone, if no other file has the name.
RenamesFound pairByName(std::vector<std::u16string> const& gone, std::vector<std::u16string> const& added);

/// Adds pairs for folders: for one that is gone, if every pair of a file below it leads to the same place
/// below one other folder, which is not in the project. It is a guess if one of these pairs is.
/// @param goneFolders relative to the root, sorted.
/// @param isListed whether a path is in the project.
template <typename IsListed>
void pairFolders(RenamesFound& renames, std::vector<std::u16string> const& goneFolders,
                 IsListed const& isListed);

/// Sorts by the earlier path, a folder before its contents.
void sortByPath(std::vector<Rename>& pairs);

/// The folder that a folder has become; empty if the pairs do not agree.
/// @param pairs of files, sorted by the earlier path.
std::u16string newFolderOf(std::u16string const& folder, std::vector<Rename> const& pairs);

/// Whether one of the pairs below a folder is a guess.
bool isGuessBelow(std::u16string const& folder, std::vector<Rename> const& pairs);

template <typename IsListed>
void pairFolders(RenamesFound& renames, std::vector<std::u16string> const& goneFolders,
                 IsListed const& isListed) {
    std::vector<Rename> folders;
    for (auto const& folder : goneFolders) {
        auto const to = newFolderOf(folder, renames.pairs);
        if (!to.empty() && to != folder && !isListed(to)) {
            auto const evidence =
                isGuessBelow(folder, renames.pairs) ? Rename::Evidence::Name : Rename::Evidence::Folder;
            folders.push_back({folder, to, FileKind::Folder, evidence, 0});
        }
    }
    renames.pairs.insert(renames.pairs.end(), folders.begin(), folders.end());
    sortByPath(renames.pairs);
}

} // namespace project::session
