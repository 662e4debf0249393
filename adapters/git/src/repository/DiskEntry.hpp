#pragma once

#include <optional>
#include <string>

#include <sys/stat.h>

namespace project::git {

/// The entry of the disk with a name, without following links; nothing if there is none or it is not
/// accessible.
inline std::optional<struct stat> diskEntryAt(std::string const& name) {
    struct stat found {};

    return ::lstat(name.c_str(), &found) == 0 ? std::optional(found) : std::nullopt;
}

/// Whether git can track an entry as such.
inline bool isFileOrLink(struct stat const& entry) {
    return S_ISREG(entry.st_mode) || S_ISLNK(entry.st_mode);
}

} // namespace project::git
