#pragma once

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "project/git/GitError.hpp"
#include "project/management.hpp"
#include "project/session/Export.hpp"
#include "project/session/Move.hpp"
#include "project/session/Personal.hpp"
#include "project/session/Query.hpp"
#include "project/session/Renames.hpp"
#include "project/session/Sync.hpp"
#include "project/session/Transaction.hpp"
#include "project/stores/HistoryLoss.hpp"
#include "project/stores/SharedServer.hpp"
#include "project/stores/StoreError.hpp"

namespace project::session {

using fl::filesystem::Path;

/// How a session treats the git repository that contains the project. Outside a repository, all values have
/// the same effect.
enum class SourceControl {
    /// Each change is staged: files that are added or removed, and the project's text as it is after the
    /// change. Every change rewrites the text, without a tail.
    ///
    /// The cost grows with the project and with git's index: both are written once for each change. With
    /// 100,000 files in both, a change takes less time than `git add` of the file and the text. Use a
    /// transaction, or choose WhenAsked, for many changes in a row.
    EachChange,

    /// As EachChange, but only Session::stage stages the text.
    WhenAsked,

    /// The session does not use git.
    Off,
};

/// How a session behaves. The defaults suit an application with a person in front of it.
struct Options {
    /// How the session treats the git repository.
    SourceControl sourceControl = SourceControl::EachChange;

    /// Whether GIT_DIR and the other variables of git's environment apply, as they do for the git command.
    /// A library should not read the environment unless it is asked to.
    bool honoursEnvironment = false;

    /// For a shared project: a read guard checks for changes only if the last check is at least this long
    /// ago. By default every guard checks, which takes a round trip to the server. Session::refresh and
    /// Session::watch always check.
    std::chrono::milliseconds freshness = std::chrono::milliseconds(0);

    /// For a shared project: whether reading continues with the last state while the server is unreachable.
    /// Otherwise it throws. Changes always need the server.
    bool readsLastState = false;
};

/// Where to create a project that a team shares: on a server, whose library must be installed.
struct SharedStore {
    std::string service; ///< the name of a service in the configuration of the server's client library
    std::string reader;  ///< the role whose members may read the project; created if it does not exist
    std::string writer;  ///< the role whose members may write it
    std::string kind = stores::usualServerKind; ///< of the server
};

/// An open project with everything that an application needs: the text store in the project's folder,
/// source control that follows every change, and events that report every change.
///
/// Order of use: open or create the session, connect slots to events(), use project(). The managers may be
/// used from several threads. A session must not stay open across a fork.
///
/// A change made through project() is one step for other threads: the store's write guard is held while the
/// operation writes and git is updated. Observers are called after that, with no lock held (unless the
/// caller holds a guard of store()).
///
/// A change takes git's lock of the index before it is committed, if it adds or removes files, and keeps it
/// until git's index is written; a failure up to the commit rolls the change back. If the project's text
/// cannot be staged after that, the change remains committed: observers are called, and then the error
/// (git::GitError) is thrown to the caller. The next change stages the text again. If a slot throws
/// as well, the caller gets the git error: until the text is staged, a commit would contain an old text.
class PROJECT_SESSION_EXPORT Session {
public:
    /// Opens the project in a folder. Does not read the project yet.
    /// @param root the project's root folder, in any form.
    /// @throws stores::StoreError if the folder does not contain a project.
    static Session open(Path const& root, Options options = {});

    /// Creates a project in a folder.
    /// @param root an existing folder.
    /// @throws stores::StoreError if the folder does not exist, or already contains a project, perhaps one
    ///         that another process has created at the same time.
    static Session create(Path const& root, std::u16string const& name, Options options = {});

    /// Opens the project in a folder, or creates it if there is none.
    /// @param root an existing folder. It is not created, so that a mistyped path creates nothing.
    /// @param name the name of a project that is created.
    /// @throws stores::StoreError if the folder does not exist.
    static Session openOrCreate(Path const& root, std::u16string const& name, Options options = {});

    /// Creates a project that a team shares: on the server, and a file in the folder that leads to it, which
    /// is staged and belongs into source control. Every session that opens the folder uses the server.
    /// @throws stores::StoreError if the folder does not exist or already contains a project, the server is
    ///         unreachable, or the user may not create projects. Nothing stays behind.
    static Session createShared(Path const& root, std::u16string const& name, SharedStore const& shared,
                                Options options = {});

    Session(Session&& other) noexcept;
    Session& operator=(Session&& other) noexcept;

    /// Invalidates all references that the session returned. Stages nothing.
    ~Session();

    /// The outermost manager: changes made through it are committed, then staged, then reported to
    /// observers.
    management::ProjectManager& project() noexcept;

    /// The personal layer: categories and labels that source control never gets.
    Personal& personal() noexcept;

    /// Finds the files and folders that meet all conditions of a query: all of them in one state of the
    /// project, in the order of the store, which is that of Path. A folder comes before its contents. Reads
    /// the store once, also for several conditions, and takes about as long as listing everything.
    ///
    /// Conditions on labels concern the labels of the project and personal ones, unless the query says
    /// otherwise.
    ///
    /// Takes the read lock, and holds none when it returns. In a transaction of this thread, the results
    /// contain its changes.
    /// @throws stores::StoreError if the project cannot be read.
    std::vector<FoundFile> find(Query const& query);

    /// Moves files and folders of the project: on disk, in the definition, and in git's index, as one change.
    /// A folder moves with everything below it, also with files that are not in the project. In the
    /// definition, labels, data in every scope, entry points, the project path and references follow; the
    /// folders above the new path are added. In git's index, staged content stays staged, a change that is
    /// not staged stays one, and a file that is not tracked stays untracked.
    ///
    /// In a transaction, the files move at once, and move back if it is rolled back. If the process dies, the
    /// next change of any process completes the move or rolls it back; see takeRecoveredMoves.
    ///
    /// Raises the events of the changes, as refresh does for those of others: onFileListUpdate with the old
    /// and the new paths, and where they apply onFileLabelsChanged with the new paths, onEntryPointsChanged,
    /// onPathChanged, onReferencesChanged, and onMetadataChange for data in other scopes. Takes the write
    /// lock.
    /// @param sources in the project, absolute.
    /// @param destination the new path; or an existing folder, which the sources move into. A source that is
    ///        there already does not move.
    /// @return the moves that were made, sorted by their old paths.
    /// @throws FileNotInProject if a source is not in the project.
    /// @throws MoveError, stores::StoreError or git::GitError; nothing has moved then.
    std::vector<Move> move(std::vector<Path> const& sources, Path const& destination);

    /// Lets the definition follow moves that were made without it: as move does, but without a change of the
    /// files on disk, which need not exist. The moves happen at the same time, so files can exchange their
    /// paths. Where a folder and a file below it both move, the file's own move decides. A folder of the file
    /// list leaves it if it has nothing below it any more and nothing else is stored for it; therefore
    /// adopting the reverse moves restores the definition. The new files are staged, and the old ones are
    /// removed from git's index, as those that are added and removed.
    /// @throws FileNotInProject if an old path is not in the project.
    /// @throws MoveError, for instance if a new path is in the project already and no move leaves it; or
    ///         stores::StoreError or git::GitError. Nothing has changed then.
    void adopt(std::vector<Move> const& moves);

    /// Pairs the files of the project that are missing on disk with files that are not in the project, so
    /// that adopt can let the project follow them.
    ///
    /// In a repository, the contents decide: those of the last commit that wrote the project's text, so that
    /// renames that were committed since are found; otherwise the staged ones, otherwise those of the last
    /// commit that contained the file. Equal contents are paired first, then similar ones, as git measures
    /// them. Files that git ignores are left out, and so are those that a sparse checkout left out. A file
    /// without any earlier content is paired by its name, as are all files outside a repository: such a pair
    /// is a guess. Contents that only a filter driver of git can convert are paired when they are staged, and
    /// only with equal ones. Changes nothing.
    ///
    /// Takes the read lock while it reads the disk and the repository.
    /// @throws std::invalid_argument if the similarity is not from 1 to 100.
    /// @throws git::GitError if the repository cannot be read.
    RenamesFound findRenames(RenameOptions const& options = {});

    /// The end of a move that another process, or an earlier session, did not finish: the last change has
    /// completed it or rolled it back. Each is returned once.
    std::optional<RecoveredMoves> takeRecoveredMoves();

    /// Whether there is an unfinished move, which the next change completes or rolls back. False while a move
    /// of this session is waiting for stage.
    bool hasUnfinishedMove() const;

    /// The rules of the folders that keep themselves up to date, in the order of the store. Takes the read
    /// lock.
    std::vector<SyncRule> syncRules();

    /// Stores a rule, in place of the one that the folder may have. Changes no file of the project.
    /// @throws exception SyncFolderUnsuitable if the folder does not exist, is outside the root or behind a
    ///         symbolic link, or belongs to the store or to source control.
    void setSyncRule(SyncRule const& rule);

    /// Removes the rule of a folder. The rules of the folders below it stay.
    /// @return false if the folder has none.
    bool removeSyncRule(Path const& folder);

    /// What sync would change. Takes the read lock while it reads the folders on disk.
    SyncPlan planSync();

    /// Brings the folders that have rules up to date: adds the files that are new on disk, and removes those
    /// that are gone, in one transaction. Files that no rule is above stay as they are. Without a rule,
    /// nothing changes. Files that git shows to be renamed keep their labels and entry points.
    ///
    /// Takes the read lock while it reads the folders, and the write lock only if there is something to do.
    /// @return what was changed.
    /// @throws exception SyncFolderMissing if the folder of a rule is missing or empty, unless the options
    ///         allow it. Nothing changes.
    /// @throws std::invalid_argument if the similarity is not from 1 to 100.
    /// @throws git::GitError if git's ignore rules cannot be read.
    SyncPlan sync(SyncOptions const& options = {});

    /// Begins a transaction: the following changes of this thread are one step, which is in the project when
    /// the transaction is committed. If one is open already, the new one is nested in it.
    ///
    /// Takes the store's write guard until the transaction ends.
    /// @throws stores::StoreError if another process holds the lock.
    Transaction transaction();

    /// Reports changes that other processes, git or an editor made to the project: dispatches the matching
    /// events on events(), and metadataChange for everything that has no event of its own.
    ///
    /// Every operation sees such changes anyway; this call reports them to observers. It reports everything
    /// since the previous call, or since the project was first read, as one change: a file that was added
    /// and removed in between is not reported. Events contain files and labels as they are now; removed
    /// ones as they were.
    ///
    /// Events are dispatched on this thread with no lock held. An exception thrown by a slot propagates to
    /// the caller; the remaining events are dispatched by the next call. Takes the read lock first: nothing
    /// new is visible while a guard is open. Costs one system call if nothing has changed.
    /// @return true if events were dispatched.
    /// @throws stores::StoreError if the text cannot be read, or remains incomplete.
    bool refresh();

    /// Waits until other programs have changed the project, and reports the changes as refresh does. A server
    /// announces changes of a shared project. For a text, and in case an announcement is lost, it checks from
    /// time to time: twice a second, and every half minute.
    /// @param time how long to wait.
    /// @return true if events were dispatched; false if the time has run out or wake was called.
    /// @throws as refresh does.
    bool watch(std::chrono::milliseconds time);

    /// Makes watch return, and the next call of it if none is waiting. May be called by any thread, while the
    /// session is neither moved nor destroyed.
    void wake() noexcept;

    /// True if a server stores the project.
    bool isShared() const noexcept;

    /// For a shared project: a loss of history that a check for changes has found since the last call, for
    /// example because the server was restored from a backup. Until a reset is taken note of with this call,
    /// changes are refused. Call it with no guard open.
    std::optional<stores::HistoryLoss> takeHistoryLoss();

    /// The broadcaster that observers connect to. An application may dispatch its own events on it. It may
    /// outlive the session.
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> const& events() const noexcept;

    /// The project's root folder, in canonical form.
    Path const& root() const noexcept;

    /// The store. Hold a guard from acquireReadLock to ask several questions about one state of the
    /// project, or a guard from acquireWriteLock to make several changes one step for other threads. What
    /// is written to the store itself is staged together with the next change.
    metadata::MetadataManager& store() noexcept;

    /// Tidies and stages the project's text if it was written since it was last staged and git tracks it.
    /// Does nothing if source control is off. Call it with no guard open, and while no other thread uses
    /// the project.
    /// @throws git::GitError, for instance if the index is locked. The changes remain committed, and the
    ///         next call tries again.
    void stage();

private:
    friend class ToolAccess;
    class State;

    explicit Session(std::unique_ptr<State> state);

    std::unique_ptr<State> state_;
};

} // namespace project::session
