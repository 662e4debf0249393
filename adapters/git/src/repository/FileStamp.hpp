#pragma once

#include <cstdint>
#include <string>

#include <sys/stat.h>

namespace project::git {

/// The identity, size and time of a file, to detect that it has changed since it was read. All zero if the
/// file does not exist.
struct FileStamp {
    dev_t device = 0;
    ino_t number = 0;
    off_t size = 0;
    std::int64_t seconds = 0;
    std::int64_t nanoseconds = 0;

    static FileStamp of(std::string const& file) {
        struct stat found {};

        if (::stat(file.c_str(), &found) != 0) {
            return {};
        }
        return {found.st_dev, found.st_ino, found.st_size, found.st_mtim.tv_sec, found.st_mtim.tv_nsec};
    }

    bool operator==(FileStamp const&) const = default;
};

} // namespace project::git
