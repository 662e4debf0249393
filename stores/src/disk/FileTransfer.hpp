#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include <sys/stat.h>

#include "project/stores/Disk.hpp"

namespace project::stores {

FileIdentity toIdentity(struct stat const& status) noexcept;

/// The state of an open file, which must be a regular one.
/// @param name how to name it in errors.
FileIdentity identifyOpenFile(int file, std::string const& name);

/// Everything from an offset to the end.
/// @throws StoreError also when the file is, or meanwhile gets, longer than Disk::longestFile.
std::string readFrom(int file, std::uint64_t offset, std::uint64_t expectedSize, std::string const& name);

/// @throws StoreError when a file is to get longer than Disk::longestFile, so that nobody could read it
/// again.
void requireRoom(std::uint64_t length, std::string const& name);

/// Writes all the bytes at the end of a file that was opened to append or is new; in one call, if the system
/// takes them all. A file that grows beyond the process's limit gives an error like a full disk, and not
/// the signal that would end the process.
void writeAll(int file, std::string_view bytes, std::string const& name);

/// Gives a file a time that no other write gives it, if the file system keeps such a time.
///
/// File systems stamp writes with a coarse clock, so that two writes in the same tick leave a file with the
/// same time. This one is taken from the fine clock, between two ticks: whoever writes after us, even at
/// once, leaves another time behind. So our own writes need not be read again, as those of others are while
/// their time is young.
/// @return nothing, with errno set, when the system can't tell the state of the file.
std::optional<WrittenFile> stamp(int file) noexcept;

} // namespace project::stores
