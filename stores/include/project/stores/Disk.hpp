#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Export.hpp"

namespace project::stores {

/// What tells one state of a file from another without reading it.
struct FileIdentity {
    std::uint64_t device = 0;
    std::uint64_t inode = 0;
    std::uint64_t size = 0;
    std::int64_t modified = 0; ///< nanoseconds since 1970
    std::int64_t changed = 0;  ///< nanoseconds since 1970
    bool isRegular = true;     ///< false for what is never opened: links, pipes, folders
    bool isShared = false;     ///< it has more names than one, perhaps in other projects

    friend bool operator==(FileIdentity const&, FileIdentity const&) = default;

    bool isSameFile(FileIdentity const& other) const noexcept {
        return device == other.device && inode == other.inode;
    }

    /// True for the same state under perhaps another name: giving a file a name changes the time `changed`.
    bool isSameState(FileIdentity const& other) const noexcept {
        return isSameFile(other) && size == other.size && modified == other.modified;
    }
};

/// What was read of a file.
struct FileContent {
    std::string bytes;
    FileIdentity identity; ///< from before the reading, so that what changed meanwhile shows at the next look
};

/// A file as the disk left it after writing.
struct WrittenFile {
    FileIdentity identity;
    bool isStamped; ///< its time is one that no other write gives it, so that any other write shows
};

/// The store's folder on disk, and all that a text backend does there.
///
/// Names are plain file names in that folder. Nothing follows a symbolic link, opens anything but a regular
/// file, or reaches outside the folder. No file longer than longestFile is read or written: what claims to be
/// longer would take more memory than there is. Every operation but those on the path and the clock needs the
/// folder open. All throw StoreError, naming the file, when the system fails them; results tell what is no
/// failure. One thread at a time.
class PROJECT_STORES_EXPORT Disk {
public:
    /// Some ten million files with labels. A sparse file takes no room on disk, whatever length it has.
    static constexpr std::uint64_t longestFile = std::uint64_t{1} << 30;

    virtual ~Disk() = default;

    /// The folder's path, absolute, as the system has it.
    virtual std::string folder() const = 0;

    /// Opens the folder that the path from the project's root leads to now, unless it is the one already
    /// open. Opening another one lets the lock go. @return false when nothing is there. Throws when it is no
    /// folder or cannot be opened.
    virtual bool openFolder() = 0;

    /// Makes the folder unless it is there, makes its entry in the root durable, and opens it unless it is
    /// the one already open. @return false when it was there.
    virtual bool makeFolder() = 0;

    /// Removes the folder if it is empty, and closes it, which lets the lock go. Never throws: what cannot
    /// be removed stays.
    virtual void removeFolder() noexcept = 0;

    /// True when the path from the project's root still leads to the open folder.
    virtual bool isFolderInPlace() = 0;

    /// Keeps other writers out, waiting for them. @return false when the time ran out.
    virtual bool lock(std::chrono::milliseconds patience) = 0;
    virtual void unlock() noexcept = 0;

    /// Who holds the lock, for a message: a process number and its command as far as they can be had, or
    /// an empty text.
    virtual std::string lockHolder() = 0;

    /// The state of the file that the path from the project's root leads to now, whatever folder is open:
    /// one system call. Empty when nothing is there.
    virtual std::optional<FileIdentity> identifyByPath(std::string const& name) = 0;

    /// The state of a file in the open folder. Empty when it is not there.
    virtual std::optional<FileIdentity> identify(std::string const& name) = 0;

    /// Everything in a file from an offset on. Empty when it is not there.
    virtual std::optional<FileContent> read(std::string const& name, std::uint64_t offset) = 0;

    /// Appends to a file that must still be in the state given, in one write, and stamps it. Not durable
    /// before sync. When it throws, a part of the bytes may stand in the file, but never all of them.
    /// @return the state afterwards; empty, with nothing written, when the file is in another state.
    virtual std::optional<WrittenFile> append(std::string const& name, FileIdentity const& expected,
                                              std::string_view bytes) = 0;

    /// Makes a new file with this content, stamped, with mode and owner of the file named like, if any. Not
    /// durable before sync. Throws when the name is taken; what a failure leaves of it is removed again.
    virtual WrittenFile create(std::string const& name, std::string_view bytes,
                               std::optional<std::string> const& like) = 0;

    /// Makes durable what append or create last wrote, through the same open file, whatever its name leads
    /// to by now.
    virtual void sync() = 0;

    /// Puts the files of two names in each other's place, at once. @return false when the file system
    /// cannot do that.
    virtual bool exchange(std::string const& left, std::string const& right) = 0;

    /// Gives a file another name, replacing what has it.
    virtual void rename(std::string const& from, std::string const& to) = 0;

    /// Gives whatever has a name another one. @return false, with nothing changed, when that one is taken.
    virtual bool renameToFree(std::string const& from, std::string const& to) = 0;

    /// Removes a file. @return false when it is not there.
    virtual bool remove(std::string const& name) = 0;

    /// Makes the names in the folder durable.
    virtual void syncFolder() = 0;

    /// The names in the folder, in no order.
    virtual std::vector<std::string> list() = 0;

    /// The time by which the file system stamps files, in nanoseconds since 1970.
    virtual std::int64_t now() = 0;

    /// Waits a moment for others.
    virtual void pause(std::chrono::milliseconds time) = 0;
};

} // namespace project::stores
