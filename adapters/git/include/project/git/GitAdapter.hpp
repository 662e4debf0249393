#pragma once

#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "cmlink/CMAdapter.hpp"
#include "project/git/Export.hpp"
#include "project/git/FileMove.hpp"
#include "project/git/GitEnvironment.hpp"
#include "project/git/SimilarContent.hpp"

namespace project::git {

class IndexUpdate;
class Repository;
class RepositoryFinder;

/// Source control by git, for the project in one folder.
///
/// The adapter finds the repository around the folder as git does: a plain repository, a linked worktree, a
/// submodule, or a work tree whose repository is elsewhere, each with or without a sparse checkout. Outside
/// every repository and in a bare one, each state is 8 and no operation has an effect. The adapter opens the
/// repository on first use. Later operations see a repository that was created, moved or configured since.
///
/// Names are compared byte by byte, regardless of `core.ignoreCase`: on disk, `File` and `file` are two
/// files.
///
/// An adapter must not be used by two threads at a time. Each operation throws GitError if the repository
/// cannot be read, has a format that this library does not know, or belongs to a user that git's
/// `safe.directory` does not list.
class PROJECT_GIT_EXPORT GitAdapter final : public cmlink::CMAdapter {
public:
    /// The path type of the whole library.
    using Path = fl::filesystem::Path;

    class Batch;

    /// Does not access the disk, and does not initialise libgit2.
    /// @param root the folder of the project.
    explicit GitAdapter(Path const& root, GitEnvironment environment = GitEnvironment::Ignored);
    ~GitAdapter() override;

    /// Stages files as `git add --force --sparse` does. Ignored files are staged too.
    ///
    /// Skips folders (git does not track them), files that do not exist, special files, and everything
    /// outside the project's folder, outside the work tree, beyond a symbolic link or in another repository
    /// inside this one. Writes the index once (see Batch); does not write it if there is nothing to stage or
    /// if anything fails.
    /// @throws GitError if the index is locked (the error's file is the lock file) or cannot be written, if a
    ///         file cannot be read, or if a file needs a filter driver or another encoding, which only git
    ///         applies.
    void addToSourceControl(std::vector<Path> const& files) override;

    /// Removes files, and all files below folders, from the index, as `git rm --cached -r` does. Skips files
    /// that are not tracked or outside the project's folder. Changes nothing on disk; the files need not
    /// exist there.
    /// @throws GitError if the index is locked (the error's file is the lock file) or cannot be written.
    void removeFromSourceControl(std::vector<Path> const& files) override;

    /// Gives the entries of files, and of all files below folders, the names that these files have after a
    /// move on disk, as `git mv` does: staged content stays staged, and a change that is not staged stays
    /// one. Files that are not tracked stay untracked. Skips paths outside the project's folder.
    /// @param moves that happened at once: no file that was moved lies in a folder that was moved.
    /// @throws GitError if the index is locked (the error's file is the lock file) or cannot be written, if a
    ///         file has a conflict, or if it is a submodule. The index is unchanged then.
    void moveInSourceControl(std::vector<FileMove> const& moves);

    /// Whether git's index contains a path, or anything below it. False outside the project's folder.
    bool isTracked(Path const& path);

    /// A text that changes when any program writes git's index; empty without a repository.
    std::string indexState();

    /// The state of every path, as `git status --no-renames` reports it.
    ///
    /// The first rule that applies determines the state:
    ///  - 8: outside the work tree
    ///  - 4: the index has conflicting entries for the path
    ///  - tracked: 3 if deleted from the disk, unless a sparse checkout left it out; 5 if not in the last
    ///    commit; 7 if its type (file, link, submodule) differs from the last commit or the index; 3 if its
    ///    content or mode differs; else 1. A submodule is 3 if another commit is checked out in it; changes
    ///    inside it belong to its own repository. A touched file with a filter driver is 3.
    ///  - 1: a folder, on disk or deleted, below which a file is tracked
    ///  - 6: in the last commit and no longer in the index, whether or not it is on disk
    ///  - 8: in a `.git` folder, beyond a symbolic link, or in another repository
    ///  - 9: does not exist, or is neither a file, a link nor a folder
    ///  - 2: ignored
    ///  - 0: everything else
    ///
    /// A file whose times and size equal those in the index is not read. An empty list returns an empty map
    /// without access to the repository.
    /// @param files absolute paths; "." and ".." are resolved as text.
    std::map<Path, cmlink::FileState> getFileStates(std::vector<Path> const& files) override;

    /// Those of some files and folders that `git add` of the folders above them would leave out: ignored and
    /// not tracked, beyond a symbolic link, in another repository inside this one, or outside the work tree.
    /// A folder is not ignored if a file below it is tracked. Empty if there is no repository.
    ///
    /// Reads no file and not the last commit, unlike getFileStates.
    /// @param files absolute paths, on disk.
    std::set<Path> ignored(std::vector<Path> const& files);

    /// Those of some files that git tracks and that are missing on disk on purpose: a sparse checkout left
    /// them out, or git was told that they are unchanged.
    /// @param files absolute paths.
    std::set<Path> leftOut(std::vector<Path> const& files);

    /// The tracked files below folders: those that removeFromSourceControl would remove from the index.
    /// @param folders absolute paths.
    /// @return paths that begin with the path of their folder, sorted.
    std::set<Path> trackedBelow(std::vector<Path> const& folders);

    /// The identities of the contents that files had earlier: in the last commit that changed a file that
    /// lists them; otherwise the staged content, that of the last commit, or that before the last commit that
    /// deleted the file. Equal contents have equal identities. Files without such a content are left out.
    /// @param files absolute paths, which need not exist on disk.
    /// @param writer the file that lists them, or a folder above all such files.
    std::map<Path, std::string> earlierContents(std::vector<Path> const& files, Path const& writer);

    /// The identities that the contents of some files on disk would have when they are staged. Stores
    /// nothing, and does not read files that are staged as they are. Others that cannot be read, or whose
    /// content only git can convert, are left out.
    /// @param files absolute paths.
    std::map<Path, std::string> contentsOnDisk(std::vector<Path> const& files);

    /// The similarities of earlier contents with files on disk, as git measures them. Contents that the
    /// repository does not have, links and files that contentsOnDisk leaves out are similar to nothing.
    /// @param before identities.
    /// @param onDisk absolute paths.
    /// @param similarity the least one, in percent.
    std::vector<SimilarContent> similarContents(std::vector<std::string> const& before,
                                                std::vector<Path> const& onDisk, int similarity);

private:
    template <typename Change>
    void stage(Change const& change);
    template <typename Condition>
    std::set<Path> select(std::vector<Path> const& files, Condition const& condition);
    Repository* repository();

    std::unique_ptr<RepositoryFinder> finder_;
    std::unique_ptr<IndexUpdate> update_; ///< of the batch; null before the first change
    bool isBatchOpen_ = false;
};

/// Writes the index once for several calls of an adapter. The calls prepare their changes: they raise all
/// errors that can be seen before the index is written, and the states include the changes. The first change
/// takes git's lock of the index, so that no other program can prevent the write.
///
/// Without publish, the index stays unchanged. An adapter has one batch at a time, and must outlive it.
class PROJECT_GIT_EXPORT GitAdapter::Batch {
public:
    /// Begins a batch. Does not access the repository.
    explicit Batch(GitAdapter& adapter);

    /// Releases the lock.
    ~Batch();
    Batch(Batch const&) = delete;
    Batch& operator=(Batch const&) = delete;

    /// Writes the index if there are changes, and releases the lock. Call it once, at the end.
    /// @throws GitError if the index cannot be written.
    void publish();

private:
    GitAdapter& adapter_;
};

} // namespace project::git
