#pragma once

#include <string>
#include <unordered_map>

#include "repository/Repository.hpp"
#include "rules/IgnoreRules.hpp"

namespace project::git {

/// The relation of a folder of the work tree to the repository.
enum class FolderKind {
    Ours,            ///< a folder whose files the repository may track
    Missing,         ///< does not exist, or is not a folder
    OtherRepository, ///< the repository's own, a submodule, a repository inside this one, or below one
    BeyondLink,      ///< a symbolic link, or below one
};

/// The folders that one call visits. Reads each from disk once.
class WorkTreeFolders {
public:
    explicit WorkTreeFolders(Repository const& repository) : repository_(repository), rules_(repository) {}

    FolderKind kindOf(TreePath const& folder) { return at(folder).kind; }

    /// Whether a rule of the repository ignores a file or link. All files in an ignored folder are ignored,
    /// regardless of more specific rules.
    bool isFileIgnored(TreePath const& path);

    /// The same for a folder.
    bool isFolderIgnored(TreePath const& path) { return at(path).isIgnored; }

private:
    struct Folder {
        FolderKind kind;
        bool isIgnored;
    };

    Folder const& at(TreePath const& folder);
    FolderKind determineKind(TreePath const& folder, FolderKind above) const;
    bool isOtherRepository(TreePath const& folder) const;

    Repository const& repository_;
    IgnoreRules rules_;
    std::unordered_map<TreePath, Folder> folders_;
};

} // namespace project::git
