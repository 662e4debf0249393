#include "index/IndexLock.hpp"

#include <cerrno>
#include <cstdio>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "project/git/GitError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::git {

namespace {

[[noreturn]] void throwUnwritable(std::string const& file, int error) {
    throw GitError(GitError::Kind::Failed, file,
                   errorTexts.get("IndexUnwritable", std::generic_category().message(error)),
                   errorTexts.get("RemedyOfUnwritableIndex"));
}

/// A file that is open for writing; created if it does not exist.
class Descriptor {
public:
    explicit Descriptor(std::string const& file)
        : file_(file), descriptor_(::open(file.c_str(), O_CREAT | O_WRONLY | O_CLOEXEC | O_NOFOLLOW, 0666)) {
        if (descriptor_ < 0) {
            throwUnwritable(file, errno);
        }
    }

    ~Descriptor() { ::close(descriptor_); }

    Descriptor(Descriptor const&) = delete;
    Descriptor& operator=(Descriptor const&) = delete;

    int get() const { return descriptor_; }

    /// Replaces the content.
    void write(std::string_view content) const {
        auto const size = static_cast<off_t>(content.size());
        while (!content.empty()) {
            auto const written = ::write(descriptor_, content.data(), content.size());
            if (written < 0 && errno != EINTR) {
                throwUnwritable(file_, errno);
            }
            content.remove_prefix(written > 0 ? static_cast<std::size_t>(written) : 0);
        }
        if (::ftruncate(descriptor_, size) != 0) { // more may have been reserved
            throwUnwritable(file_, errno);
        }
    }

private:
    std::string const& file_;
    int descriptor_;
};

} // namespace

IndexLock::IndexLock(std::string index)
    : index_(std::move(index)), lock_(index_ + ".lock"), newIndex_(index_ + ".lock.new") {
    auto const descriptor = ::open(lock_.c_str(), O_CREAT | O_EXCL | O_WRONLY | O_CLOEXEC, 0666);
    if (descriptor < 0 && errno == EEXIST) {
        throw GitError(GitError::Kind::Busy, lock_, errorTexts.get("IndexLocked"),
                       errorTexts.get("RemedyOfLockedIndex"));
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

void IndexLock::reserve(std::size_t size) const {
    Descriptor const file(newIndex_);
    bool const isReserved = ::fallocate(file.get(), 0, 0, static_cast<off_t>(size)) == 0;
    if (!isReserved && (errno == ENOSPC || errno == EDQUOT || errno == EFBIG)) {
        throwUnwritable(newIndex_, errno);
    }
}

FileStamp IndexLock::replaceIndex(std::string_view content) const {
    struct stat old {};

    {
        Descriptor const file(newIndex_);
        file.write(content);
        if (::stat(index_.c_str(), &old) == 0) {
            ::fchmod(file.get(), old.st_mode & 07777); // a repository may be shared with a group
        }
    }
    auto const result = FileStamp::of(newIndex_);
    if (::rename(newIndex_.c_str(), index_.c_str()) != 0) {
        throwUnwritable(index_, errno);
    }
    return result;
}

} // namespace project::git
