#pragma once

#include <chrono>
#include <string>

namespace project::stores {

/// Keeps other writers out of a folder, waiting for them. The lock belongs to the open folder and goes with
/// it, also when the process dies.
///
/// Writers get it in the order in which they come, where the file system keeps a queue (see QueuePlace):
/// before one that waits each other one comes at most once, unless the one that waits is kept from running.
/// Without patience the lock is not taken either when somebody waits for it.
/// @param folder the open folder's descriptor.
/// @param name how to name it in errors.
/// @return false when the time ran out.
/// @throws StoreError when the file system has no locks.
bool lockFolder(int folder, std::string const& name, std::chrono::milliseconds patience);

void unlockFolder(int folder) noexcept;

/// The process that holds the lock, as "process 1234 (its command)"; empty when it cannot be found out.
std::string findLockHolder(int folder);

} // namespace project::stores
