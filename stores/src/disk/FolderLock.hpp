#pragma once

#include <chrono>
#include <string>

namespace project::stores {

/// Locks a folder against other writers; waits for the current lock holder. The lock belongs to the open
/// folder and ends when it is closed, also when the process dies.
///
/// If the file system supports a queue (see QueuePlace), writers get the lock in the order in which they
/// arrive: each other writer overtakes a waiting one at most once, unless the waiting process is stopped.
/// Without patience, the lock is not taken if another writer waits for it.
/// @param folder the open folder's descriptor.
/// @param name the name for errors.
/// @return false when the time has run out.
/// @throws StoreError if the file system does not support locks.
bool lockFolder(int folder, std::string const& name, std::chrono::milliseconds patience);

void unlockFolder(int folder) noexcept;

/// The lock holder, as "process 1234 (its command)"; empty if it is unknown.
std::string findLockHolder(int folder);

} // namespace project::stores
