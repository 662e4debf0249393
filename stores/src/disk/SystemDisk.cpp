#include "project/stores/SystemDisk.hpp"

#include <cerrno>
#include <cstdio>
#include <memory>
#include <thread>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "disk/FileTransfer.hpp"
#include "disk/FolderLock.hpp"
#include "disk/ForkSafeDescriptor.hpp"
#include "disk/SystemError.hpp"
#include "disk/SystemFolder.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

/// Opens a file without following a link and without waiting for the other end of a pipe.
constexpr int safely = O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC;

/// The state of the file at a path relative to an open folder.
/// @param name the name for errors.
std::optional<FileIdentity> identifyIn(int folder, std::string const& path, std::string const& name) {
    struct stat status {};

    if (::fstatat(folder, path.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0) {
        if (errno == ENOENT || errno == ENOTDIR) {
            return std::nullopt;
        }
        throwSystemError(name, "CannotExamine", errno);
    }
    return toIdentity(status);
}

/// Gives a new file the mode and the owner of another one, as far as permitted: only a privileged process may
/// change the owner of a file.
void copyModeAndOwner(int folder, int file, std::string const& like) noexcept {
    struct stat wanted {};

    struct stat given {};

    if (::fstatat(folder, like.c_str(), &wanted, AT_SYMLINK_NOFOLLOW) != 0 || !S_ISREG(wanted.st_mode) ||
        ::fstat(file, &given) != 0) {
        return;
    }
    bool const owned = wanted.st_uid == given.st_uid && wanted.st_gid == given.st_gid;
    if (!owned && ::fchown(file, wanted.st_uid, wanted.st_gid) != 0 &&
        ::fchown(file, static_cast<uid_t>(-1), wanted.st_gid) != 0) {
        wanted.st_mode &=
            ~static_cast<mode_t>(S_ISUID | S_ISGID); // these must not apply with another owner's rights
    }
    ::fchmod(file, wanted.st_mode & 07777); // last, since changing the owner can clear mode bits
}

/// True if the file system or the kernel does not support this kind of renaming.
bool isUnsupported(int error) noexcept {
    return error == ENOSYS || error == EINVAL || error == EOPNOTSUPP;
}

/// The folder and its files on the file system. Each call is relative to the open folder.
class SystemDisk : public Disk {
public:
    SystemDisk(std::string root, std::string const& name) : folder_(std::move(root), name) {}

    std::string folder() const override { return folder_.path(); }

    bool openFolder() override { return folder_.open(); }

    bool makeFolder() override { return folder_.make(); }

    void removeFolder() noexcept override { folder_.remove(); }

    bool isFolderInPlace() override { return folder_.isInPlace(); }

    bool lock(std::chrono::milliseconds patience) override;
    void unlock() noexcept override;
    std::string lockHolder() override;
    std::optional<FileIdentity> identifyByPath(std::string const& name) override;
    std::optional<FileIdentity> identify(std::string const& name) override;
    std::optional<FileContent> read(std::string const& name, std::uint64_t offset) override;
    std::optional<WrittenFile> append(std::string const& name, FileIdentity const& expected,
                                      std::string_view bytes) override;
    WrittenFile create(std::string const& name, std::string_view bytes,
                       std::optional<std::string> const& like) override;
    void sync() override;
    bool exchange(std::string const& left, std::string const& right) override;
    void rename(std::string const& from, std::string const& to) override;
    bool renameToFree(std::string const& from, std::string const& to) override;
    bool remove(std::string const& name) override;
    void syncFolder() override;
    std::vector<std::string> list() override;
    std::int64_t now() override;
    void pause(std::chrono::milliseconds time) override;

private:
    /// @return false if there is no file with that name.
    bool openFile(ForkSafeDescriptor& file, std::string const& name, int flags) const;

    SystemFolder folder_;
    ForkSafeDescriptor written_; ///< the file that sync makes durable
    std::string writtenName_;
    std::string identifiedPath_; ///< kept for its memory: every guard identifies the text
};

bool SystemDisk::lock(std::chrono::milliseconds patience) {
    return lockFolder(folder_.get(), folder_.path(), patience);
}

void SystemDisk::unlock() noexcept {
    if (folder_.isOpen()) {
        unlockFolder(folder_.get());
    }
}

std::string SystemDisk::lockHolder() {
    return findLockHolder(folder_.get());
}

std::optional<FileIdentity> SystemDisk::identifyByPath(std::string const& name) {
    folder_.requireOwnProcess();
    identifiedPath_.assign(folder_.path()).append("/").append(name);
    return identifyIn(AT_FDCWD, identifiedPath_, identifiedPath_);
}

std::optional<FileIdentity> SystemDisk::identify(std::string const& name) {
    return identifyIn(folder_.get(), name, folder_.pathOf(name));
}

bool SystemDisk::openFile(ForkSafeDescriptor& file, std::string const& name, int flags) const {
    int const folder = folder_.get();
    if (file.open([&] { return ::openat(folder, name.c_str(), flags | safely); })) {
        return true;
    }
    if (errno == ENOENT) {
        return false;
    }
    if (errno == ELOOP || errno == ENXIO) { // a link, or a pipe without a reader
        throw StoreError(StoreError::Kind::Damaged, folder_.pathOf(name), 0,
                         errorTexts.get(errno == ELOOP ? "IsLink" : "NotAFile"),
                         errorTexts.get("RestoreOwnFile"));
    }
    throwSystemError(folder_.pathOf(name), "CannotOpen", errno);
}

std::optional<FileContent> SystemDisk::read(std::string const& name, std::uint64_t offset) {
    ForkSafeDescriptor file;
    if (!openFile(file, name, O_RDONLY)) {
        return std::nullopt;
    }
    std::string const path = folder_.pathOf(name);
    auto const identity = identifyOpenFile(file.get(), path);
    return FileContent{readFrom(file.get(), offset, identity.size, path), identity};
}

std::optional<WrittenFile> SystemDisk::append(std::string const& name, FileIdentity const& expected,
                                              std::string_view bytes) {
    writtenName_ = folder_.pathOf(name);
    if (!openFile(written_, name, O_WRONLY | O_APPEND)) {
        return std::nullopt;
    }
    try {
        if (identifyOpenFile(written_.get(), writtenName_) != expected) {
            written_.close();
            return std::nullopt;
        }
        requireWritableLength(expected.size + bytes.size(), writtenName_);
        writeAll(written_.get(), bytes, writtenName_);
    } catch (...) {
        written_.close();
        throw;
    }
    // The batch is in the file even if its times are unknown. The next check then reads it again.
    WrittenFile const unknown{{expected.device, expected.inode, expected.size + bytes.size()}, false};
    return stamp(written_.get()).value_or(unknown);
}

WrittenFile SystemDisk::create(std::string const& name, std::string_view bytes,
                               std::optional<std::string> const& like) {
    int const folder = folder_.get();
    int const flags = O_WRONLY | O_CREAT | O_EXCL | safely;
    writtenName_ = folder_.pathOf(name);
    if (!written_.open([&] { return ::openat(folder, name.c_str(), flags, 0666); })) {
        throwSystemError(writtenName_, "CannotCreate", errno);
    }
    try {
        if (like) {
            copyModeAndOwner(folder, written_.get(), *like);
        }
        requireWritableLength(bytes.size(), writtenName_);
        writeAll(written_.get(), bytes, writtenName_);
        if (auto const created = stamp(written_.get())) {
            return *created;
        }
        throwSystemError(writtenName_, "CannotExamine", errno);
    } catch (...) {
        written_.close();
        ::unlinkat(folder, name.c_str(), 0);
        throw;
    }
}

void SystemDisk::sync() {
    folder_.requireOwnProcess();
    int const synced = repeatWhenInterrupted([this] { return ::fdatasync(written_.get()); });
    int const syncError = synced != 0 ? errno : 0;
    int const closeError = written_.close(); // some file systems report a full disk only here
    if (syncError != 0 || closeError != 0) {
        throwSystemError(writtenName_, "CannotSync", syncError != 0 ? syncError : closeError);
    }
}

bool SystemDisk::exchange(std::string const& left, std::string const& right) {
    int const folder = folder_.get();
    if (::renameat2(folder, left.c_str(), folder, right.c_str(), RENAME_EXCHANGE) == 0) {
        return true;
    }
    if (!isUnsupported(errno)) {
        throwSystemError(folder_.pathOf(right), "CannotReplace", errno);
    }
    return false;
}

void SystemDisk::rename(std::string const& from, std::string const& to) {
    int const folder = folder_.get();
    if (::renameat(folder, from.c_str(), folder, to.c_str()) != 0) {
        throwSystemError(folder_.pathOf(to), "CannotReplace", errno);
    }
}

bool SystemDisk::renameToFree(std::string const& from, std::string const& to) {
    int const folder = folder_.get();
    int result = ::renameat2(folder, from.c_str(), folder, to.c_str(), RENAME_NOREPLACE);
    if (result != 0 && isUnsupported(errno)) {
        // Without a call that does both in one step, another program can create the name in between.
        struct stat taken {};

        if (::fstatat(folder, to.c_str(), &taken, AT_SYMLINK_NOFOLLOW) == 0) {
            return false;
        }
        result = ::renameat(folder, from.c_str(), folder, to.c_str());
    }
    if (result != 0 && errno != EEXIST) {
        throwSystemError(folder_.pathOf(to), "CannotCreate", errno);
    }
    return result == 0;
}

bool SystemDisk::remove(std::string const& name) {
    if (::unlinkat(folder_.get(), name.c_str(), 0) == 0) {
        return true;
    }
    if (errno != ENOENT) {
        throwSystemError(folder_.pathOf(name), "CannotDelete", errno);
    }
    return false;
}

void SystemDisk::syncFolder() {
    int const folder = folder_.get();
    if (repeatWhenInterrupted([folder] { return ::fsync(folder); }) != 0) {
        throwSystemError(folder_.path(), "CannotSync", errno);
    }
}

std::vector<std::string> SystemDisk::list() {
    int const opened = repeatWhenInterrupted(
        [here = folder_.get()] { return ::openat(here, ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC); });
    auto* const stream = opened >= 0 ? ::fdopendir(opened) : nullptr;
    if (stream == nullptr) {
        int const error = errno;
        if (opened >= 0) {
            ::close(opened);
        }
        throwSystemError(folder_.path(), "CannotList", error);
    }
    std::unique_ptr<DIR, decltype([](DIR* folder) { ::closedir(folder); })> const closing(stream);
    std::vector<std::string> names;
    errno = 0;
    while (auto const* entry = ::readdir(stream)) {
        std::string name(entry->d_name);
        if (name != "." && name != "..") {
            names.push_back(std::move(name));
        }
        errno = 0;
    }
    if (errno != 0) {
        throwSystemError(folder_.path(), "CannotList", errno);
    }
    return names;
}

std::int64_t SystemDisk::now() {
    timespec time{};
    ::clock_gettime(CLOCK_REALTIME_COARSE, &time);
    return std::int64_t{time.tv_sec} * 1'000'000'000 + time.tv_nsec;
}

void SystemDisk::pause(std::chrono::milliseconds time) {
    std::this_thread::sleep_for(time);
}

} // namespace

std::unique_ptr<Disk> makeSystemDisk(fl::filesystem::Path projectRoot, fl::filesystem::Path folderName) {
    return std::make_unique<SystemDisk>(fl::filesystem::toSystem(projectRoot).string(),
                                        fl::filesystem::toSystem(folderName).string());
}

} // namespace project::stores
