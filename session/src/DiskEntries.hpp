#pragma once

#include <optional>
#include <vector>

#include <sys/stat.h>

#include "project/session/Move.hpp"

namespace project::session {

using fl::filesystem::Path;

/// The entry of the disk at a path, without following a link; nothing if there is none, or none that can be
/// seen.
std::optional<struct stat> diskEntry(Path const& path);

/// Whether the new path of a move is free: nothing is there, or only the file itself, on a file system that
/// ignores the case of names.
bool isFree(Move const& move);

/// Gives a file or folder its new path. Replaces nothing.
/// @throws MoveError
void moveOnDisk(Move const& move);

/// Makes the new and the old names of moved files durable.
/// @throws MoveError with the reason DiskFailed.
void syncNames(std::vector<Move> const& moves);

} // namespace project::session
