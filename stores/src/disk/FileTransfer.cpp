#include "disk/FileTransfer.hpp"

#include <cerrno>
#include <csignal>
#include <cstdint>
#include <ctime>

#include <sys/mman.h>
#include <unistd.h>

#include "disk/SystemError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

std::int64_t nanoseconds(timespec const& time) noexcept {
    return std::int64_t{time.tv_sec} * 1'000'000'000 + time.tv_nsec;
}

/// Blocks the signal for a file beyond the limit in this thread, and consumes it if it is raised.
class FileSizeSignalBlocked {
public:
    FileSizeSignalBlocked() noexcept {
        sigemptyset(&signal_);
        sigaddset(&signal_, SIGXFSZ);
        sigset_t pending;
        sigpending(&pending);
        wasPending_ = sigismember(&pending, SIGXFSZ) == 1;
        pthread_sigmask(SIG_BLOCK, &signal_, &before_);
    }

    ~FileSizeSignalBlocked() {
        if (!wasPending_) {
            timespec const atOnce{};
            repeatWhenInterrupted([&] { return sigtimedwait(&signal_, nullptr, &atOnce); });
        }
        pthread_sigmask(SIG_SETMASK, &before_, nullptr);
    }

    FileSizeSignalBlocked(FileSizeSignalBlocked const&) = delete;
    FileSizeSignalBlocked& operator=(FileSizeSignalBlocked const&) = delete;

private:
    sigset_t signal_;
    sigset_t before_;
    bool wasPending_;
};

void requireReadableLength(std::uint64_t length, std::string const& name) {
    if (length > Disk::longestFile) {
        throw StoreError(StoreError::Kind::Damaged, name, 0, errorTexts.get("TooLong"),
                         errorTexts.get("RestoreOwnFile"));
    }
}

/// Reserves memory. For a large text, the system provides it in huge pages where it has them, and otherwise
/// all pages in one call; without that, each page would be provided by a fault of its own, which takes as
/// long as reading the text.
void reserveAtOnce(std::string& bytes, std::size_t size) {
    constexpr std::size_t hugePage = 2 << 20;
    auto const page = static_cast<std::size_t>(::sysconf(_SC_PAGESIZE));
    if (size < 64 * page) {
        bytes.reserve(size);
        return;
    }
    // A mapping whose length is a multiple of a huge page's begins at such a page; the allocator adds a
    // header.
    std::size_t const wholePages = (size + page + hugePage - 1) / hugePage * hugePage - page;
    bytes.reserve(size < hugePage ? size : wholePages);
    std::size_t const inPage = reinterpret_cast<std::uintptr_t>(bytes.data()) % page;
    char* const begin = bytes.data() - inPage;
    if (size >= hugePage) {
        ::madvise(begin, inPage + bytes.capacity(), MADV_HUGEPAGE);
    }
    ::madvise(begin, inPage + size, MADV_POPULATE_WRITE); // older systems refuse
}

/// The fine clock's time, changed by a nanosecond if it is equal to the coarse clock's.
timespec timeBetweenTicks() noexcept {
    timespec coarse{};
    timespec fine{};
    ::clock_gettime(CLOCK_REALTIME_COARSE, &coarse);
    ::clock_gettime(CLOCK_REALTIME, &fine);
    if (nanoseconds(coarse) == nanoseconds(fine)) {
        fine.tv_nsec += fine.tv_nsec < 999'999'999 ? 1 : -1;
    }
    return fine;
}

} // namespace

FileIdentity toIdentity(struct stat const& status) noexcept {
    return {status.st_dev,
            status.st_ino,
            static_cast<std::uint64_t>(status.st_size),
            nanoseconds(status.st_mtim),
            nanoseconds(status.st_ctim),
            S_ISREG(status.st_mode),
            status.st_nlink > 1};
}

FileIdentity identifyOpenFile(int file, std::string const& name) {
    struct stat status {};

    if (::fstat(file, &status) != 0) {
        throwSystemError(name, "CannotExamine", errno);
    }
    if (!S_ISREG(status.st_mode)) {
        throw StoreError(StoreError::Kind::Damaged, name, 0, errorTexts.get("NotAFile"),
                         errorTexts.get("RestoreOwnFile"));
    }
    return toIdentity(status);
}

void requireWritableLength(std::uint64_t length, std::string const& name) {
    if (length > Disk::longestFile) {
        throw StoreError(StoreError::Kind::Refused, name, 0, errorTexts.get("WouldBeTooLong"),
                         errorTexts.get("RemedyOfLength"));
    }
}

std::string readFrom(int file, std::uint64_t offset, std::uint64_t expectedSize, std::string const& name) {
    requireReadableLength(expectedSize, name);
    std::string bytes;
    // One byte more than expected, so that the first call finds the end too.
    std::size_t const firstSize = expectedSize > offset ? expectedSize - offset + 1 : 1;
    reserveAtOnce(bytes, firstSize);
    bytes.resize(firstSize);
    std::size_t length = 0;
    for (;;) {
        auto const count = repeatWhenInterrupted([&] {
            return ::pread(file, bytes.data() + length, bytes.size() - length,
                           static_cast<off_t>(offset + length));
        });
        if (count < 0) {
            throwSystemError(name, "CannotRead", errno);
        }
        if (count == 0) {
            break;
        }
        length += static_cast<std::size_t>(count);
        requireReadableLength(offset + length, name); // it may grow during the read
        if (length == bytes.size()) {
            bytes.resize(bytes.size() * 2);
        }
    }
    bytes.resize(length);
    return bytes;
}

void writeAll(int file, std::string_view bytes, std::string const& name) {
    FileSizeSignalBlocked const blocked;
    while (!bytes.empty()) {
        auto const count = repeatWhenInterrupted([&] { return ::write(file, bytes.data(), bytes.size()); });
        if (count < 0) {
            throwSystemError(name, "CannotWrite", errno);
        }
        bytes.remove_prefix(static_cast<std::size_t>(count));
    }
}

std::optional<WrittenFile> stamp(int file) noexcept {
    auto const time = timeBetweenTicks();
    timespec const times[] = {{0, UTIME_OMIT}, time};
    bool const isSet = ::futimens(file, times) == 0;

    struct stat status {};

    if (::fstat(file, &status) != 0) {
        return std::nullopt;
    }
    auto const identity = toIdentity(status);
    return WrittenFile{identity, isSet && identity.modified == nanoseconds(time)};
}

} // namespace project::stores
