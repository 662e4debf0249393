#pragma once

#include <string>

#include "project/stores/Disk.hpp"

namespace project::stores {

/// Deletes the leftovers of dead writers, and completes an exchange that a writer began. The folder must be
/// locked, since then the writers of all temporary files are dead.
///
/// If another program put a text in place at the moment of an exchange, and the writer died before it
/// restored that text, the text is restored to its place, or set aside if the place is taken. A file that
/// cannot be deleted, as in a read-only project, stays. Costs one listing of the folder. If there are
/// temporary files, a writer may have died before it made the names durable, so they are made durable here.
void removeLeftovers(Disk& disk);

/// Renames a file of another program to a name that the store does not need.
/// @return that name.
std::string setAside(Disk& disk, std::string const& name);

} // namespace project::stores
