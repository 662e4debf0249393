#include "index/IndexLock.hpp"

#include <cerrno>
#include <cstdio>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "project/git/GitError.hpp"

namespace project::git {

namespace {

[[noreturn]] void throwUnwritable(std::string const& file, int error) {
    throw GitError(GitError::Kind::Failed, file,
                   "the index cannot be written: " + std::generic_category().message(error),
                   "Check the permissions of the repository and the free space on its disk, and try again.");
}

} // namespace

IndexLock::IndexLock(std::string index)
    : index_(std::move(index)), lock_(index_ + ".lock"), newIndex_(index_ + ".lock.new") {
    auto const descriptor = ::open(lock_.c_str(), O_CREAT | O_EXCL | O_WRONLY | O_CLOEXEC, 0666);
    if (descriptor < 0 && errno == EEXIST) {
        throw GitError(GitError::Kind::Busy, lock_,
                       "the index is locked: git is running in this repository, or was killed",
                       "Try again when it has ended; if git is not running, delete this file and try again.");
    }
    if (descriptor < 0) {
        throwUnwritable(lock_, errno);
    }
    ::close(descriptor);
    ::unlink(newIndex_.c_str()); // a leftover
}

IndexLock::~IndexLock() {
    ::unlink(newIndex_.c_str());
    ::unlink(lock_.c_str());
}

void IndexLock::replaceIndex() const {
    struct stat old {};

    if (::stat(index_.c_str(), &old) == 0) {
        ::chmod(newIndex_.c_str(), old.st_mode & 07777); // a repository may be shared with a group
    }
    if (::rename(newIndex_.c_str(), index_.c_str()) != 0) {
        throwUnwritable(index_, errno);
    }
}

} // namespace project::git
