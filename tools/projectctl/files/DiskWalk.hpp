#pragma once

#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "output/Progress.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// The contents of folders on disk, at any depth. Symbolic links are found but not followed.
class DiskWalk {
public:
    struct Unreadable {
        Path folder;
        std::string problem;
    };

    /// @param root the project's root.
    DiskWalk(Path root, Progress& progress);

    /// Adds the contents of a folder to `found`, folders before their contents. May be called for several
    /// folders.
    void enter(Path const& folder);

    std::vector<Path> const& found() const noexcept { return found_; }

    /// Paths directly in the root whose names begin with two dots. A project cannot contain them or anything
    /// below them.
    std::vector<Path> const& unaddable() const noexcept { return unaddable_; }

    /// Folders of `found` that could not be read.
    std::vector<Unreadable> const& unreadable() const noexcept { return unreadable_; }

private:
    struct Open;

    void open(Path folder, std::vector<Open>& openFolders);

    Path root_;
    Progress& progress_;
    std::vector<Path> found_;
    std::vector<Path> unaddable_;
    std::vector<Unreadable> unreadable_;
};

} // namespace projectctl
