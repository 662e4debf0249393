#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

#include "project/session.hpp"
#include "project/session/DiskFolder.hpp"
#include "project/session/FileLevel.hpp"
#include "project/session/Query.hpp"
#include "project/stores/Change.hpp"

namespace project::stores {
class Backend;
class JournalBackend;
class TextBackend;
class TreeMetadataManager;
} // namespace project::stores

namespace project::session {

/// A file or folder while it is visited. What it refers to is valid during the call that receives it.
struct VisitedFile {
    std::u16string const& path; ///< relative to the root
    std::size_t depth;          ///< number of folders between it and the path at which the visit began
    FileKind kind;              ///< a file or a folder
    metadata::MetadataNode const& node; ///< the value stored for it
};

/// Receives files one by one. It must not change the project.
using FileVisitor = std::function<void(VisitedFile const&)>;

/// Receives the number of entries that a comparison with the disk has reached.
using DiskProgress = std::function<void(std::size_t)>;

/// The differences between the file list and the disk.
struct DiskDifferences {
    /// On disk but not in the project. A folder without any files in the project is listed without its
    /// contents.
    std::vector<FoundFile> added;

    std::vector<FoundFile> gone; ///< in the project but not on disk; a folder before its contents

    std::vector<UnreadableFolder> unreadable; ///< folders that could not be compared
};

/// The parts of a session that only projectctl needs: it checks, repairs and merges the text itself.
/// Applications do not need this header.
class PROJECT_SESSION_EXPORT ToolAccess {
public:
    /// @param session must outlive this object. It may be moved meanwhile.
    explicit ToolAccess(Session& session) noexcept;

    /// The backend of the store: a text, or the log of a shared project.
    stores::Backend& backend() noexcept;

    /// The session's store.
    stores::TreeMetadataManager& store() noexcept;

    /// The log of a shared project; otherwise null.
    stores::JournalBackend* log() noexcept;

    /// The store's text. A change made through it is not staged; see markTextForStaging.
    /// @throws stores::StoreError with the kind Refused if the project is shared.
    stores::TextBackend& text();

    /// The store of the personal layer. Take its guards after one of the session's store.
    stores::TreeMetadataManager& personalStore() noexcept;

    /// Whether the open transaction concerns the personal layer.
    bool hasPersonalChanges() const noexcept;

    /// The text behind that store, which may not exist yet.
    stores::TextBackend& personalText() noexcept;

    /// Visits the files that a query finds, as Session::find returns them. The caller holds a guard of the
    /// store.
    void visit(Query const& query, FileVisitor const& visitor);

    /// The level of an address of the file list; empty if the address does not exist. The caller holds a
    /// guard of the store.
    FileLevel level(metadata::MetadataPath const& address);

    /// The address of a file in the file list. @param path absolute, the project's root or below it.
    metadata::MetadataPath addressOf(Path const& path) const;

    /// Compares the file list with the disk. The caller holds a guard of the store.
    /// @param folder absolute, the root or below it, and not beyond a symbolic link.
    /// @param progress may be empty.
    DiskDifferences compareWithDisk(Path const& folder, DiskProgress const& progress);

    /// Adds files and folders, and keeps the labels of the folders above them. The file manager would drop
    /// those. Call it in a transaction.
    /// @param added those of them that are in the project already are added again, without their labels.
    void addBelowLabelledFolders(std::vector<Path> const& added);

    /// Passes on the addresses directly below one address, as TreeMetadataManager::loadChildren does.
    void loadChildren(metadata::MetadataPath const& address, stores::ChildSink& children);

    /// Lets the next call of Session::stage stage the text, although the store did not write it: for
    /// changes made through text().
    void markTextForStaging() noexcept;

    /// A guard for work with git, which only one thread at a time may do: a write guard of a text, so that no
    /// other process changes it meanwhile. For a shared project a read guard, since the lock of a server
    /// takes round trips and keeps other machines waiting; use the session with one thread then.
    cmlink::ReentrantReadWriteLock::LockGuard guardForSourceControl();

    /// Stages those of these files whose removal is staged. For files that were removed and are now added
    /// again: adding stages only files that git does not know. A session with EachChange does this itself.
    /// Takes guardForSourceControl.
    void stageReturned(std::vector<Path> const& files);

    /// Stages that the file which leads to the definition was replaced by another one: the new files, and the
    /// removal of the old one. Does nothing if git does not track the old one. Call it while no other thread
    /// uses the session.
    void stageReplaced(stores::FileChanges const& files);

    /// The files in some folders that git tracks and that are not in the project. If such a folder is
    /// removed from the project, these files are removed from git's index too. Takes guardForSourceControl.
    /// @param folders absolute.
    /// @return in Path order; empty if source control is off.
    std::vector<Path> trackedOutsideProject(std::vector<Path> const& folders);

private:
    Session::State& state_;
};

} // namespace project::session
