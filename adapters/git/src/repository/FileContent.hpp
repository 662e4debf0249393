#pragma once

#include <cstddef>
#include <optional>
#include <string>

namespace project::git {

/// Whether to read through a symbolic link in place of a file.
enum class Links { Followed, NotFollowed };

/// All bytes of a file; nothing, with errno set, if it cannot be read.
/// @param expectedSize the number of bytes, if the caller knows it.
std::optional<std::string> readFile(std::string const& name, Links links, std::size_t expectedSize = 4095);

/// The target of a symbolic link; nothing, with errno set, if it cannot be read.
std::optional<std::string> readLink(std::string const& name);

} // namespace project::git
