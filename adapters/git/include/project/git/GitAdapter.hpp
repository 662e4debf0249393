#pragma once

#include <map>
#include <memory>
#include <set>
#include <vector>

#include "cmlink/CMAdapter.hpp"
#include "project/git/Export.hpp"
#include "project/git/GitEnvironment.hpp"

namespace project::git {

class RepositoryFinder;

/// Source control by git, for the project in one folder.
///
/// The repository is the one that the folder lies in, found as git finds it: a plain repository, a linked
/// worktree, a submodule, a work tree whose repository lies elsewhere, each with or without a sparse
/// checkout. Outside any, and in a bare repository, every state is 8 and nothing is done. It is looked for
/// with the first question and kept open; whoever makes, moves or configures one meanwhile is noticed with
/// the next.
///
/// Names are compared byte by byte, whatever `core.ignoreCase` says: the disk tells `File` from `file`.
///
/// One adapter is used by one thread at a time. Each operation throws GitError when the repository can't be
/// read, is written in a way that this library doesn't know, or belongs to somebody whom git's
/// `safe.directory` doesn't list.
class PROJECT_GIT_EXPORT GitAdapter final : public cmlink::CMAdapter {
public:
    using Path = fl::filesystem::Path;

    /// Asks nothing of the disk yet.
    /// @param root the folder of the project.
    explicit GitAdapter(Path const& root, GitEnvironment environment = GitEnvironment::Ignored);
    ~GitAdapter() override;

    /// Stages these files as `git add --force --sparse` does, and of a folder nothing, since git knows none.
    ///
    /// What is not there, what lies outside the project's folder or the work tree, beyond a symbolic link or
    /// in another repository inside this one, and what is neither a file nor a link is passed over. An
    /// ignored file that is named is staged. The index is written once, or not at all when nothing is left to
    /// do or anything fails.
    /// @throws GitError when the index is locked (the error's file is the lock file) or can't be written,
    ///         when a file can't be read, or when one would have to go through a filter driver or be encoded
    ///         anew, which git alone does.
    void addToSourceControl(std::vector<Path> const& files) override;

    /// Takes these files, and all below these folders, out of the index, as `git rm --cached -r` does. What
    /// isn't tracked, or lies outside the project's folder, is passed over. The disk is left alone, and need
    /// not have the files any more.
    /// @throws GitError when the index is locked (the error's file is the lock file) or can't be written.
    void removeFromSourceControl(std::vector<Path> const& files) override;

    /// The state of every path, as `git status` sees it without looking for renames.
    ///
    /// The first of these that holds counts:
    ///  - 8 outside the work tree
    ///  - 4 with conflicting entries in the index
    ///  - in the index: 3 gone from the disk, unless a sparse checkout left it out; 5 not in the last commit;
    ///    7 of another type (file, link, submodule) than in the last commit or the index; 3 other than there;
    ///    else 1. A submodule is 3 when another commit is checked out in it; what else is changed inside is
    ///    its own repository's. A file that a filter driver would have to read, and that was touched, is 3.
    ///  - a folder, on the disk or gone: 1 when anything below it is tracked
    ///  - 6 in the last commit and no longer in the index, whether or not it is on the disk
    ///  - 8 in a `.git` folder, beyond a symbolic link, or in another repository
    ///  - 9 not there, or neither file, link nor folder
    ///  - 2 ignored, else 0
    ///
    /// Files whose times and size are those in the index are not read. An empty list gives an empty map at
    /// once, without a look at the repository.
    /// @param files absolute paths; "." and ".." are taken as text.
    std::map<Path, cmlink::FileState> getFileStates(std::vector<Path> const& files) override;

    /// The files in the index below some folders, which removeFromSourceControl would take out of it.
    /// @param folders absolute. @return each folder's path with the file's behind it, sorted.
    std::set<Path> trackedBelow(std::vector<Path> const& folders);

private:
    std::unique_ptr<RepositoryFinder> finder_;
};

} // namespace project::git
