#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "FileTree.hpp"
#include "project/session/DiskFolder.hpp"
#include "project/session/ToolAccess.hpp"

namespace project::session {

/// Compares the file list with the disk, folder by folder. The caller holds a guard of the store.
class DiskComparison {
public:
    /// @param files, root borrowed.
    DiskComparison(FileTree const& files, Path const& root) : root_(root), list_(files) {}

    /// Compares a folder and everything below it. May be called for several folders.
    /// @param folder absolute, the root or below it, and not beyond a symbolic link.
    /// @param progress receives the number of entries that were compared; may be empty.
    void run(Path const& folder, DiskProgress const& progress);

    /// Counts a folder and everything that the project lists below it as gone, whatever is on disk.
    void takeGone(Path const& folder);

    DiskDifferences take() noexcept { return std::move(found_); }

private:
    using Address = metadata::MetadataPath;
    using Entry = FileLevel::Entry;

    void compare(Path const& folder, Address const& address, FileLevel const& listed,
                 DiskProgress const& progress);
    void compareBoth(Path const& folder, Address const& address, Entry const& file, DiskEntry const& entry,
                     DiskProgress const& progress);
    void compareListed(Path const& path, Address const& address);
    void lookFor(Path const& folder, Address const& address, FileLevel const& listed, Entry const& file);
    void takeAdded(Path const& folder, DiskEntry const& entry);

    Path const& root_;
    FileTree const& list_;
    std::size_t seen_ = 0;
    DiskDifferences found_;
};

} // namespace project::session
