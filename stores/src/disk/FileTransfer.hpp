#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include <sys/stat.h>

#include "project/stores/Disk.hpp"

namespace project::stores {

FileIdentity toIdentity(struct stat const& status) noexcept;

/// The state of an open file.
/// @param name the name for errors.
/// @throws StoreError if it is not a regular file.
FileIdentity identifyOpenFile(int file, std::string const& name);

/// The bytes from an offset to the end.
/// @throws StoreError also if the file is longer than Disk::longestFile, or becomes so during the read.
std::string readFrom(int file, std::uint64_t offset, std::uint64_t expectedSize, std::string const& name);

/// @throws StoreError if a file of this length would be longer than Disk::longestFile and thus unreadable.
void requireWritableLength(std::uint64_t length, std::string const& name);

/// Writes all bytes at the end of a file that is new or was opened to append; in one call if the system
/// accepts all of them. A file that exceeds the limit of the process causes an error, like a full disk, and
/// not the signal that would end the process.
void writeAll(int file, std::string_view bytes, std::string const& name);

/// Gives a file a time that no other write produces, if the file system keeps such a time.
///
/// File systems stamp writes with a coarse clock, so two writes in one tick leave the same time. This time is
/// taken from the fine clock, between two ticks: any later write, even an immediate one, leaves another time.
/// The store therefore need not read its own writes again, as it does with recent writes of other programs.
/// @return nothing, with errno set, if the state of the file is unknown.
std::optional<WrittenFile> stamp(int file) noexcept;

} // namespace project::stores
