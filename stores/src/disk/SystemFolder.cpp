#include "disk/SystemFolder.hpp"

#include <cerrno>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "disk/FileTransfer.hpp"
#include "disk/SystemError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

SystemFolder::SystemFolder(std::string root, std::string const& name)
    : root_(std::move(root)), name_(name), path_(root_ + (root_.ends_with('/') ? "" : "/") + name) {
}

int SystemFolder::get() const {
    requireOwnProcess();
    if (!folder_.isOpen()) {
        throwSystemError(path_, "CannotUse", ENOENT);
    }
    return folder_.get();
}

void SystemFolder::requireOwnProcess() const {
    if (folder_.isInForkedChild()) {
        throw StoreError(StoreError::Kind::Refused, path_, 0, errorTexts.get("OpenedBeforeFork"),
                         errorTexts.get("RemedyOfFork"));
    }
}

void SystemFolder::openRoot(ForkSafeDescriptor& root, int flags) const {
    requireOwnProcess();
    if (!root.open([&] { return ::open(root_.c_str(), flags | O_DIRECTORY | O_CLOEXEC); })) {
        throwSystemError(root_, "CannotOpen", errno);
    }
}

bool SystemFolder::open() {
    ForkSafeDescriptor root;
    openRoot(root, O_PATH);
    return openIn(root.get());
}

bool SystemFolder::openIn(int root) {
    struct stat status {};

    if (::fstatat(root, name_.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0) {
        if (errno == ENOENT) {
            return false;
        }
        throwSystemError(path_, "CannotExamine", errno);
    }
    if (!S_ISDIR(status.st_mode)) {
        throw StoreError(StoreError::Kind::Damaged, path_, 0,
                         errorTexts.get(S_ISLNK(status.st_mode) ? "IsLink" : "NotAFolder"),
                         errorTexts.get("RemedyOfTakenFolder"));
    }
    if (folder_.isOpen() && identity_.isSameFile(toIdentity(status))) {
        return true;
    }
    int const flags = O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC;
    if (!folder_.open([&] { return ::openat(root, name_.c_str(), flags); }) ||
        ::fstat(folder_.get(), &status) != 0) {
        throwSystemError(path_, "CannotOpen", errno);
    }
    identity_ = toIdentity(status);
    return true;
}

bool SystemFolder::make() {
    ForkSafeDescriptor root;
    openRoot(root, O_RDONLY);
    bool const isCreated = ::mkdirat(root.get(), name_.c_str(), 0777) == 0;
    if (!isCreated && errno != EEXIST) {
        throwSystemError(path_, "CannotCreate", errno);
    }
    if (!openIn(root.get())) {
        throwSystemError(path_, "CannotOpen", ENOENT);
    }
    if (repeatWhenInterrupted([&root] { return ::fsync(root.get()); }) != 0) {
        auto const error = errno;
        if (isCreated) {
            remove();
        }
        throwSystemError(root_, "CannotSync", error);
    }
    return isCreated;
}

void SystemFolder::remove() noexcept {
    if (!folder_.isOpen()) {
        return;
    }
    try {
        if (isInPlace()) {
            ::rmdir(path_.c_str()); // fails if the folder is not empty
        }
    } catch (StoreError const&) {
        // a folder that cannot be examined stays
    }
    folder_.close();
}

bool SystemFolder::isInPlace() const {
    requireOwnProcess();

    if (!folder_.isOpen()) {
        return false;
    }

    struct stat status {};

    if (::lstat(path_.c_str(), &status) != 0) {
        if (errno == ENOENT || errno == ENOTDIR) {
            return false;
        }
        // Not false: the caller would report that the batch is not in the project.
        throwSystemError(path_, "CannotExamine", errno);
    }
    return S_ISDIR(status.st_mode) && identity_.isSameFile(toIdentity(status));
}

} // namespace project::stores
