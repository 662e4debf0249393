#pragma once

#include <string>

#include "project/stores/Disk.hpp"

namespace project::stores {

/// Removes the temporary files of dead writers, or does with them what their writer had no time for. Whoever
/// holds the folder's lock may call this, since then the writers of all temporary files are dead.
///
/// A text that git or an editor put in place at the moment of a rewrite, and that the writer had not put back
/// when it died, goes back to its place, or aside where that is taken. What cannot be removed, as in a
/// project that is read-only, stays. Costs a listing of the folder; where there are temporary files, a writer
/// may have died before it made the names durable, and so they are made durable here.
void removeLeftovers(Disk& disk);

/// Gives something that is not the store's own a name where it is in nobody's way.
/// @return that name.
std::string setAside(Disk& disk, std::string const& name);

} // namespace project::stores
