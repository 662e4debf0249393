#pragma once

#include <cstddef>
#include <functional>
#include <optional>
#include <string>

namespace project::test {

/// Runs a function in a forked process, and kills that process right before one of its system calls that
/// change files: the creation, renaming, deletion, writing or syncing of a file or folder.
/// @param call the number of that call, counted from 1.
/// @return the name of the call; nothing if the function made fewer of them and has returned.
/// @throws std::runtime_error if the function failed.
std::optional<std::string> killAtCall(std::size_t call, std::function<void()> const& run);

} // namespace project::test
