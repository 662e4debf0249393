#pragma once

#include <cstddef>
#include <set>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/session/DiskFolder.hpp"
#include "project/session/Move.hpp"
#include "project/session/Query.hpp"
#include "project/session/Renames.hpp"

namespace project::session {

/// A folder that keeps itself up to date: Session::sync adds the files that are new in it and removes those
/// that are gone. The rule is stored in the project, at the folder: it moves with the folder, and is removed
/// from the project with it.
///
/// The nearest rule above a file decides alone. A file that no rule is above is not synchronised.
struct SyncRule {
    /// Absolute, the root or below it.
    fl::filesystem::Path folder;

    /// Patterns as Query::glob describes them, for paths relative to the folder of the rule. A new file is
    /// added if one of them matches; all are if there is none.
    std::set<std::u16string> included = {};

    /// Patterns in the same form. A new file is not added if one of them matches it or a folder above it.
    std::set<std::u16string> excluded = {};

    /// Whether files are left out that git ignores, and that are in another repository inside the project's.
    /// Outside a repository nothing is ignored.
    bool usesGitIgnore = true;

    friend bool operator==(SyncRule const&, SyncRule const&) = default;
};

/// How Session::sync behaves.
struct SyncOptions {
    /// Whether everything below a rule's folder may be removed from the project although the folder itself is
    /// missing or empty, as it is when it is not mounted.
    bool removesMissingFolders = false;

    /// Whether files that were renamed keep their labels and entry points: see SyncPlan::renamed.
    bool followsRenames = true;

    /// From which contents are similar enough for a rename, in percent, from 1 to 100.
    int similarity = usualSimilarity;
};

/// A file or folder that a synchronisation removes from the project, with what is lost by it.
struct RemovedFile {
    FoundFile file;                          ///< the file or folder
    std::vector<LabelChoice> labels;         ///< those that it has
    std::vector<std::u16string> entryPoints; ///< their names

    /// Returns true if the removal loses a label or an entry point.
    bool isAnythingLost() const noexcept { return !labels.empty() || !entryPoints.empty(); }
};

/// What a synchronisation changes. Everything is in the order of the store.
struct SyncPlan {
    /// Files that the project has followed to their new paths. Session::planSync leaves them among those that
    /// are removed and added.
    ///
    /// They are the pairs of Session::findRenames of which the old or the new path would be removed or added,
    /// or is the folder of a rule. Guesses by the name alone and ambiguous renames are not followed, so
    /// nothing is outside a repository. Neither is a folder if a file of it that is gone would get the place
    /// of a new file that it is not a pair with.
    std::vector<Move> renamed = {};

    /// New files. The folders above them are added with them.
    std::vector<FoundFile> added;

    /// Files that are gone, and the folders that are gone with all their contents. Patterns and git's ignore
    /// rules choose what is added, not what is removed. A file that a sparse checkout left out is not gone.
    std::vector<RemovedFile> removed;

    /// Folders with a rule that are missing or empty, although the project lists something below them that
    /// the rule would remove.
    std::vector<fl::filesystem::Path> missing;

    /// Folders with a rule that do not exist, and in which there is nothing that the rule would remove.
    /// Another program may have renamed them: a rule moves with its folder only where the move is adopted.
    std::vector<fl::filesystem::Path> absent;

    /// Folders that could not be read. What is in them stays as it is.
    std::vector<UnreadableFolder> unreadable;

    /// Returns true if there is nothing to do.
    bool isEmpty() const noexcept { return renamed.empty() && added.empty() && removed.empty(); }
};

} // namespace project::session
