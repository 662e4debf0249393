#pragma once

#include <optional>
#include <string>

#include <sys/stat.h>

namespace project::git {

/// What is on disk under a name, links not followed; nothing when nothing is, or nobody may look.
inline std::optional<struct stat> diskEntryAt(std::string const& name) {
    struct stat found {};

    return ::lstat(name.c_str(), &found) == 0 ? std::optional(found) : std::nullopt;
}

/// What git can track by itself.
inline bool isFileOrLink(struct stat const& entry) {
    return S_ISREG(entry.st_mode) || S_ISLNK(entry.st_mode);
}

} // namespace project::git
