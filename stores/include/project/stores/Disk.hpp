#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Export.hpp"

namespace project::stores {

/// The properties that distinguish one state of a file from another without reading the file.
struct FileIdentity {
    std::uint64_t device = 0;  ///< the file system
    std::uint64_t inode = 0;   ///< the file in it
    std::uint64_t size = 0;    ///< in bytes
    std::int64_t modified = 0; ///< nanoseconds since 1970
    std::int64_t changed = 0;  ///< nanoseconds since 1970
    bool isRegular = true;     ///< false for links, pipes and folders, which are never opened
    bool isShared = false;     ///< it has more than one name, perhaps in other projects

    friend bool operator==(FileIdentity const&, FileIdentity const&) = default;

    /// Returns true for the same file, also in another state.
    bool isSameFile(FileIdentity const& other) const noexcept {
        return device == other.device && inode == other.inode;
    }

    /// True for the same state, perhaps under another name: renaming a file changes the time `changed`.
    bool isSameState(FileIdentity const& other) const noexcept {
        return isSameFile(other) && size == other.size && modified == other.modified;
    }
};

/// The bytes that were read from a file.
struct FileContent {
    std::string bytes;     ///< the content
    FileIdentity identity; ///< from before the read, so that the next check finds a change during the read
};

/// The state of a file after the disk wrote it.
struct WrittenFile {
    FileIdentity identity; ///< the new state
    bool isStamped; ///< its time is one that no other write produces, so that any other write is detected
};

/// The store's folder on disk, with the operations that a text backend needs.
///
/// Names are plain file names in that folder. No operation follows a symbolic link, opens anything but a
/// regular file, or accesses anything outside the folder. No file longer than longestFile is read or written,
/// since it would need more memory than there is. All operations except those on the path and the clock
/// require the folder to be open. All throw StoreError, naming the file, when a system call fails. One thread
/// at a time.
class PROJECT_STORES_EXPORT Disk {
public:
    /// Enough for some ten million files with labels. A limit is necessary because a sparse file of any
    /// length takes no space on disk.
    static constexpr std::uint64_t longestFile = std::uint64_t{1} << 30;

    virtual ~Disk() = default;

    /// The folder's path, absolute, in the bytes of the system.
    virtual std::string folder() const = 0;

    /// Opens the folder that the path from the project's root leads to now, unless it is already open.
    /// Opening another folder releases the lock. @return false if there is nothing at the path. Throws if it
    /// is not a folder or cannot be opened.
    virtual bool openFolder() = 0;

    /// Creates the folder if it does not exist, makes its name in the root durable, and opens it unless it is
    /// already open. @return false if it existed.
    virtual bool makeFolder() = 0;

    /// Deletes the folder if it is empty, and closes it, which releases the lock. Never throws: a folder that
    /// cannot be deleted stays.
    virtual void removeFolder() noexcept = 0;

    /// True if the path from the project's root still leads to the open folder.
    virtual bool isFolderInPlace() = 0;

    /// Excludes other writers; waits for the current one. @return false when the time has run out.
    virtual bool lock(std::chrono::milliseconds patience) = 0;
    /// Admits other writers.
    virtual void unlock() noexcept = 0;

    /// The lock holder, for a message: its process number and command as far as they can be found out, or an
    /// empty text.
    virtual std::string lockHolder() = 0;

    /// The state of the file that the path from the project's root leads to now, whichever folder is open:
    /// one system call. Empty if there is no file.
    virtual std::optional<FileIdentity> identifyByPath(std::string const& name) = 0;

    /// The state of a file in the open folder. Empty if there is no file.
    virtual std::optional<FileIdentity> identify(std::string const& name) = 0;

    /// The bytes of a file from an offset to the end. Empty if there is no file.
    virtual std::optional<FileContent> read(std::string const& name, std::uint64_t offset) = 0;

    /// Appends to a file in one write and stamps it, if the file is still in the state given. Durable after
    /// sync. If it throws, some of the bytes may be in the file, but never all of them.
    /// @return the state afterwards; empty, with nothing written, if the file is in another state.
    virtual std::optional<WrittenFile> append(std::string const& name, FileIdentity const& expected,
                                              std::string_view bytes) = 0;

    /// Creates a file with this content and stamps it. It gets the mode and the owner of the file named like,
    /// if that is given. Durable after sync. Throws if the name is taken; after a failure there is no file.
    virtual WrittenFile create(std::string const& name, std::string_view bytes,
                               std::optional<std::string> const& like) = 0;

    /// Makes the bytes of the last append or create durable, through the same open file, whatever its name
    /// leads to by now.
    virtual void sync() = 0;

    /// Exchanges the files of two names in one step. @return false if the file system cannot do that.
    virtual bool exchange(std::string const& left, std::string const& right) = 0;

    /// Renames a file; replaces a file that has the new name.
    virtual void rename(std::string const& from, std::string const& to) = 0;

    /// Renames a file. @return false, with nothing changed, if the new name is taken.
    virtual bool renameToFree(std::string const& from, std::string const& to) = 0;

    /// Deletes a file. @return false if there is no file.
    virtual bool remove(std::string const& name) = 0;

    /// Makes the names in the folder durable.
    virtual void syncFolder() = 0;

    /// The names in the folder, in no order.
    virtual std::vector<std::string> list() = 0;

    /// The clock by which the file system stamps files, in nanoseconds since 1970.
    virtual std::int64_t now() = 0;

    /// Sleeps, so that another program can finish its write.
    virtual void pause(std::chrono::milliseconds time) = 0;
};

} // namespace project::stores
