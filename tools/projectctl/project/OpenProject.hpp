#pragma once

#include <chrono>
#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "project/WriteShield.hpp"
#include "project/session.hpp"
#include "project/session/ToolAccess.hpp"
#include "project/stores/JournalBackend.hpp"
#include "project/stores/Node.hpp"
#include "project/stores/TextBackend.hpp"
#include "texts/Message.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// A project with its store, opened for one command or one batch of commands.
///
/// Commands use the managers. Commands that only read use the store directly where they must be fast, or must
/// see entries that a manager cannot handle.
class OpenProject {
public:
    /// Opens the project in a folder. Nothing is read yet, and nothing is written.
    explicit OpenProject(Path const& root);
    ~OpenProject();

    /// Creates a project in a folder.
    /// @throws StoreError when there is already one.
    static OpenProject create(Path const& root, std::u16string const& name);

    /// Creates a project on a server, with a file in the folder that leads to it.
    /// @throws StoreError when there is a project already, or the server refuses it.
    static OpenProject createShared(Path const& root, std::u16string const& name,
                                    project::session::SharedStore const& shared);

    /// Opens the project that contains the working folder.
    /// @throws Failure when there is none.
    static OpenProject ofWorkingFolder();

    OpenProject(OpenProject const&) = delete;
    OpenProject& operator=(OpenProject const&) = delete;

    Path const& root() const noexcept { return session_.root(); }

    project::management::ProjectManager& manager() noexcept { return session_.project(); }

    project::management::FileManager& files() { return manager().getFileManager(); }

    /// The personal categories and labels.
    project::session::Personal& personal() noexcept { return session_.personal(); }

    /// @throws FileNotInProject
    void requireInProject(Path const& path);

    project::session::Session& session() noexcept { return session_; }

    project::metadata::MetadataManager& store() noexcept { return session_.store(); }

    /// The backend of the store, which does not contain the changes of a transaction. Its `load` may be
    /// called while a guard of the store is open.
    project::stores::Backend& backend() { return access_.backend(); }

    /// The text behind the store.
    /// @throws StoreError if a server stores the project.
    project::stores::TextBackend& text() { return access_.text(); }

    /// The log of a project that a server stores; otherwise null.
    project::stores::JournalBackend* log() { return access_.log(); }

    /// The parts of the session for commands that read the store directly.
    project::session::ToolAccess& access() noexcept { return access_; }

    /// Passes on the addresses directly below one address, with the changes of a transaction. Call it with a
    /// guard of the store open.
    void loadChildren(project::metadata::MetadataPath const& address, project::stores::ChildSink& children) {
        access_.loadChildren(address, children);
    }

    /// The faults of the text, or of what was read of the log. In a transaction, those that were found before
    /// it: reading again would show the changes of other programs in the middle of it. Otherwise call this
    /// without an open guard.
    std::vector<project::stores::Fault> const& faults();

    bool isInTransaction() const noexcept { return openTransactions_ > 0; }

    WriteShield& shield() noexcept { return *shield_; }

    /// The path of the text or the name of the log, for messages.
    std::string definition();

    /// The path of another file in the store's folder, for messages. @param name in UTF-8.
    std::string storeFile(std::string const& name) const;

    /// Warns on standard error, in one line, if the definition is damaged or contains conflicts, because a
    /// listing may then be incomplete. Does nothing in a transaction. Call this without an open guard.
    void warnOfDamage();

    /// The same for a shared project only, also in a transaction, which has read the log already.
    void warnOfDamageInLog();

    /// Warns on standard error, in one line, if the server of a shared project was reset to an earlier state.
    void warnOfReset();

    /// Reads the changes of other programs, and raises the events for them.
    void refresh() { session_.refresh(); }

    /// The same for a shared project, after it has waited for a change.
    void watch(std::chrono::milliseconds time) { session_.watch(time); }

    project::management::ProjectEventBroadcaster& events() noexcept { return *session_.events(); }

    /// Moves files as project::session::Session::move does.
    std::vector<project::session::Move> move(std::vector<Path> const& sources, Path const& destination) {
        return session_.move(sources, destination);
    }

    /// Adopts moves as project::session::Session::adopt does.
    void adopt(std::vector<project::session::Move> const& moves) { session_.adopt(moves); }

    /// Says on standard error that a change has completed a move of a process that died, or rolled it back.
    void reportRecoveredMoves();

    /// Warns on standard error, in one line, if the next change has to do that.
    void warnOfUnfinishedMove();

    /// Lets stage() stage those of these files whose removal is staged: they were added, and git may know
    /// them as removed ones. A transaction that is rolled back takes the request back.
    void stageReturnedLater(std::vector<Path> const& files);

    /// Brings git's index up to date after the command's work: stages the text, if it was written and git
    /// tracks it, and the files of stageReturnedLater that are in the project. Call this without an open
    /// guard.
    void stage();

    /// Marks the text as changed through text(), so that stage() stages it.
    void stageLater() noexcept { access_.markTextForStaging(); }

    /// Stages that the folder's definition is another file now, if git tracks the old one.
    void stageReplaced(project::stores::FileChanges const& files) { access_.stageReplaced(files); }

    /// The files below some folders that git tracks and that are not in the project. @param folders absolute.
    std::vector<Path> trackedOutsideProject(std::vector<Path> const& folders) {
        return access_.trackedOutsideProject(folders);
    }

    /// Files that the command has changed.
    struct ChangedFiles {
        std::size_t listed = 0;   ///< added to the file list or removed from it
        std::size_t labelled = 0; ///< with other labels

        std::size_t total() const noexcept { return listed + labelled; }
    };

    ChangedFiles& changedFiles() noexcept { return changed_; }

    bool isInNestedTransaction() const noexcept { return openTransactions_ > 1; }

    /// Shows this on standard error at the end of the command.
    void setHint(Message const& hint) { hint_ = hint; }

    void showHint() const;

private:
    friend class ProjectTransaction;
    using Session = project::session::Session;

    explicit OpenProject(Session session);

    void stageReturned();
    void warnOfFaults();

    std::shared_ptr<WriteShield>
        shield_; ///< before the session, so that it is destroyed after the last write
    Session session_;
    project::session::ToolAccess access_{session_};
    std::vector<Path> returned_; ///< of stageReturnedLater
    std::vector<project::stores::Fault> faults_;
    std::size_t openTransactions_ = 0;
    ChangedFiles changed_;
    std::optional<Message> hint_;
};

} // namespace projectctl
