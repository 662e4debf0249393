#include "disk/SystemError.hpp"

#include <cerrno>
#include <system_error>

namespace project::stores {

namespace {

char const* remedyFor(int error) {
    switch (error) {
    case ENOSPC:
        return "Make room on the disk and try again.";
    case EDQUOT:
        return "Make room within the quota and try again.";
    case EFBIG:
        return "Raise the limit on the size of files (ulimit -f) and try again.";
    case EACCES:
    case EPERM:
        return "Check the owner and the permissions of the file and of its folder.";
    case EROFS:
        return "The file system is read-only: mount it writable, or work on a copy.";
    case EMFILE:
    case ENFILE:
        return "Close some files or raise the limit on open files (ulimit -n), and try again.";
    case EIO:
        return "The disk is failing: check the system's log, and keep a copy of the project elsewhere.";
    case ENOENT:
    case ENOTDIR:
        return "Check whether the project was moved or deleted.";
    case ESTALE:
        return "Reopen the project.";
    case ENOMEM:
        return "Free some memory and try again.";
    case ENAMETOOLONG:
    case EILSEQ:
        return "The file system does not accept the name: keep the project under a shorter path, or on "
               "another file "
               "system.";
    case EINVAL:
    case ENOSYS:
    case EOPNOTSUPP:
    case ENOLCK:
        return "The file system does not support an operation that the store needs: keep the project on "
               "another file system.";
    default:
        return "Try again; if the error persists, check the system's log.";
    }
}

} // namespace

void throwSystemError(std::string const& file, char const* action, int error) {
    throw StoreError(StoreError::Kind::DiskFailed, file, 0,
                     std::string(action) + ": " + std::generic_category().message(error), remedyFor(error));
}

} // namespace project::stores
