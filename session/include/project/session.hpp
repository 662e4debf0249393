#pragma once

#include <memory>
#include <string>

#include "project/management.hpp"
#include "project/session/Export.hpp"

namespace project::stores {
class TextBackend;
}

namespace project::session {

using fl::filesystem::Path;

/// How a session treats the git repository that the project lies in. Outside any repository all are alike.
enum class SourceControl {
    /// What is added is staged and what is removed is taken out of the index, and after each change the
    /// project's text is staged as it is then. The text is written anew by every change, without a tail.
    ///
    /// What that takes grows with the project and with git's index, which is written for the files and again
    /// for the text: with 100,000 files in both 0.4 s for each change, twice what the git command takes. Who
    /// makes many changes chooses WhenAsked.
    EachChange,

    /// The same, but the text is staged by Session::stage alone.
    WhenAsked,

    /// Git is left alone.
    Off,
};

struct Options {
    SourceControl sourceControl = SourceControl::EachChange;

    /// Whether GIT_DIR and its like count, as for the git command. A library should not read the environment
    /// unasked.
    bool honoursEnvironment = false;
};

/// A project that is open on its folder, with all that an application wants around it: the text store beside
/// the project's files, source control that follows every change, and events that tell of it.
///
/// The order of use: open or make it, connect slots to events(), use project(). The managers may be used from
/// several threads, but calls of add and remove must not overlap. A session is not left open across a fork.
class PROJECT_SESSION_EXPORT Session {
public:
    /// Opens the project in a folder. Nothing of it is read yet.
    /// @param root the project's root folder, in any form.
    /// @throws stores::StoreError when there is none.
    static Session open(Path const& root, Options options = {});

    /// Makes a project in a folder.
    /// @throws stores::StoreError when there is one already.
    static Session make(Path const& root, std::u16string const& name, Options options = {});

    /// Opens the project in a folder, and makes it if there is none.
    /// @param name of the project that is made.
    static Session openOrMake(Path const& root, std::u16string const& name, Options options = {});

    Session(Session&& other) noexcept;
    Session& operator=(Session&& other) noexcept;

    /// Ends all that was handed out. Stages nothing.
    ~Session();

    /// The outermost manager: changes made through it are staged and tell observers, in this order, after the
    /// store has been written.
    management::ProjectManager& project() noexcept;

    /// Takes in what others have changed in the project - other processes, git, an editor - and tells
    /// observers: dispatches the events that match on events(), and metadataChange for the rest.
    ///
    /// What others change is seen by every operation all the same; this makes it known. It tells all that has
    /// changed since the last call, or since the project was first looked at, as one change: a file that came
    /// and went again is not told. Files and labels are told as they are or, where they went, as they were.
    ///
    /// Events are dispatched on this thread with no lock held. What a slot throws leaves this; the events
    /// behind it are dispatched by the next call. Takes the read lock first: while a guard is open there is
    /// nothing new to see. Costs one system call when nothing has changed.
    /// @return true if there was something to tell.
    /// @throws stores::StoreError when the text can't be read, or stays incomplete.
    bool refresh();

    /// Where observers connect; an application may dispatch events of its own here. It may outlive the
    /// session.
    std::shared_ptr<management::DispatchableProjectEventBroadcaster> const& events() const noexcept;

    /// The project's root folder, canonical.
    Path const& root() const noexcept;

    /// The store, for whoever wants one state of the project for several questions, or one step for several
    /// changes: the guard that acquireReadLock or acquireWriteLock gives is held around them.
    metadata::MetadataManager& store() noexcept;

    /// What the store keeps the project in, to look after its text. What is changed through it is not staged
    /// by itself.
    stores::TextBackend& text() noexcept;

    /// Tidies the project's text and stages it, if something was written since it was last staged, and if git
    /// tracks it. Stages nothing when source control is off. To be called with no guard open, while no other
    /// thread uses the project.
    /// @throws git::GitError, for instance when the index is locked: the changes stand, and the next call
    ///         tries again.
    void stage();

    /// Stages those of some files that were just added whose removal git has staged, as after a remove:
    /// source control places what git does not know. EachChange does so by itself. Takes the write lock.
    void stageReturned(std::vector<Path> const& files);

    /// Has the next call of stage stage the text, whoever wrote it: for changes made through text().
    void stageLater() noexcept;

    /// Which files below some folders git tracks although they are not in the project: removing such a folder
    /// takes them out of git's index too.
    /// Takes the write lock.
    /// @param folders absolute. @return in Path order; empty when source control is off.
    std::vector<Path> trackedOutsideProject(std::vector<Path> const& folders);

private:
    class State;

    explicit Session(std::unique_ptr<State> state);

    std::unique_ptr<State> state_;
};

} // namespace project::session
