#pragma once

#include <cstddef>
#include <set>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/session/DiskFolder.hpp"
#include "project/session/Query.hpp"

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

struct SyncOptions {
    /// Whether everything below a rule's folder may be removed from the project although the folder itself is
    /// missing or empty, as it is when it is not mounted.
    bool removesMissingFolders = false;
};

/// A file or folder that a synchronisation removes from the project, with what is lost by it.
struct RemovedFile {
    FoundFile file;
    std::vector<LabelChoice> labels;
    std::vector<std::u16string> entryPoints; ///< their names

    bool isAnythingLost() const noexcept { return !labels.empty() || !entryPoints.empty(); }
};

/// What a synchronisation changes. Everything is in the order of the store.
struct SyncPlan {
    /// New files. The folders above them are added with them.
    std::vector<FoundFile> added;

    /// Files that are gone, and the folders that are gone with all their contents. Patterns and git's ignore
    /// rules choose what is added, not what is removed. A file that a sparse checkout left out is not gone.
    std::vector<RemovedFile> removed;

    /// Folders with a rule that are missing or empty, although the project lists something below them that
    /// the rule would remove.
    std::vector<fl::filesystem::Path> missing;

    /// Folders that could not be read. What is in them stays as it is.
    std::vector<UnreadableFolder> unreadable;

    bool isEmpty() const noexcept { return added.empty() && removed.empty(); }
};

} // namespace project::session
