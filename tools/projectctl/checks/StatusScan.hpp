#pragma once

#include <string>
#include <vector>

#include "files/DiskFolder.hpp"
#include "output/Progress.hpp"
#include "project/FileList.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Compares the file list with the disk, folder by folder.
class StatusScan {
public:
    struct File {
        Path path; ///< absolute
        Kind kind;
    };

    explicit StatusScan(OpenProject& project);

    /// Makes the comparison. Call it once.
    void run(Progress& progress);

    /// The files and folders that are on disk but not in the project. A folder without any files in the
    /// project is listed without its contents.
    std::vector<File> const& added() const noexcept { return added_; }

    /// The files and folders that are in the project but not on disk.
    std::vector<File> const& gone() const noexcept { return gone_; }

    /// One line for each folder that could not be read.
    std::vector<std::string> const& unreadable() const noexcept { return unreadable_; }

private:
    using Address = project::metadata::MetadataPath;

    void compare(Path const& folder, Address const& address, FileList::Level const& listed,
                 Progress& progress);
    void compareBoth(Path const& folder, Address const& address, FileList::Entry const& file,
                     DiskEntry const& entry, Progress& progress);
    void compareListed(Path const& path, Address const& address);
    void lookFor(Path const& folder, Address const& address, FileList::Level const& listed,
                 FileList::Entry const& file);
    void takeAdded(Path const& folder, DiskEntry const& entry);
    void takeGone(Path const& path);

    Path root_;
    FileList list_;
    std::size_t seen_ = 0;
    std::vector<File> added_;
    std::vector<File> gone_;
    std::vector<std::string> unreadable_;
};

} // namespace projectctl
