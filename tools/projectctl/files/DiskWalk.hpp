#pragma once

#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "output/Progress.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// What lies in a folder on disk, at any depth. Symbolic links are listed and not entered.
class DiskWalk {
public:
    struct Unreadable {
        Path folder;
        std::string problem;
    };

    /// @param root the project's root.
    DiskWalk(Path root, Progress& progress);

    /// Takes in everything in a folder, a folder before its contents. May be called for several folders.
    void enter(Path const& folder);

    std::vector<Path> const& found() const noexcept { return found_; }

    /// What begins with two dots directly in the root: a project cannot hold it, nor what is in it.
    std::vector<Path> const& unaddable() const noexcept { return unaddable_; }

    /// Folders that are in `found` and could not be looked into.
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
