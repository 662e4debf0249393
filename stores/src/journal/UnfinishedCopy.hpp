#pragma once

#include <string>

#include "project/stores/Disk.hpp"

namespace project::stores {

// A copy of a project to a store of another kind gives the folder a new file, which leads to the new store,
// and then sets the old one aside. Between these steps the folder contains both. A mark distinguishes this
// state from one that a merge leaves, and says which of the two files is the old one. A copy holds the lock
// of the folder.
//
// All functions throw StoreError, except for removeCopyMark.

/// Holds the lock of the folder, for which it waits.
class FolderGuard {
public:
    explicit FolderGuard(Disk& disk);
    ~FolderGuard();
    FolderGuard(FolderGuard const&) = delete;
    FolderGuard& operator=(FolderGuard const&) = delete;

private:
    Disk& disk_;
};

/// Marks durably that a copy replaces a file.
void markCopy(Disk& disk, std::string const& old);

/// Deletes the mark. It may stay if that fails: it is not used unless both files are there.
void removeCopyMark(Disk& disk) noexcept;

/// Renames the old file to its name with ".old", or ".old2" and so on, durably, and deletes the mark.
void finishCopy(Disk& disk, std::string const& old);

/// Finishes the copy of a process that died, in a folder with both files. Waits for a copy that is in
/// progress.
/// @return false, with nothing changed, if the folder does not contain both because of a copy, or if the old
///         file was changed since.
bool finishCopyOfOther(Disk& disk);

} // namespace project::stores
