#include "disk/SystemError.hpp"

#include <cerrno>
#include <system_error>

#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

/// The name of the text.
char const* remedyFor(int error) {
    switch (error) {
    case ENOSPC:
        return "RemedyOfFullDisk";
    case EDQUOT:
        return "RemedyOfQuota";
    case EFBIG:
        return "RemedyOfFileLimit";
    case EACCES:
    case EPERM:
        return "RemedyOfPermission";
    case EROFS:
        return "RemedyOfReadOnly";
    case EMFILE:
    case ENFILE:
        return "RemedyOfOpenFiles";
    case EIO:
        return "RemedyOfFailingDisk";
    case ENOENT:
    case ENOTDIR:
        return "RemedyOfMissing";
    case ESTALE:
        return "RemedyOfStale";
    case ENOMEM:
        return "RemedyOfMemory";
    case ENAMETOOLONG:
    case EILSEQ:
        return "RemedyOfName";
    case EINVAL:
    case ENOSYS:
    case EOPNOTSUPP:
    case ENOLCK:
        return "RemedyOfUnsupported";
    default:
        return "RemedyOfOtherError";
    }
}

} // namespace

void throwSystemError(std::string const& file, char const* problem, int error) {
    throw StoreError(StoreError::Kind::DiskFailed, file, 0,
                     errorTexts.get(problem, std::generic_category().message(error)),
                     errorTexts.get(remedyFor(error)));
}

} // namespace project::stores
