#pragma once

#include <cstddef>
#include <optional>
#include <string>

namespace project::git {

/// Whether a symbolic link in place of a file counts as the file that it leads to.
enum class Links { Followed, NotFollowed };

/// All bytes of a file. Nothing, with errno, when it can't be read.
/// @param expectedSize how many there will be, if the caller knows.
std::optional<std::string> readFile(std::string const& name, Links links, std::size_t expectedSize = 4095);

/// What a symbolic link leads to. Nothing, with errno, when it can't be read.
std::optional<std::string> readLink(std::string const& name);

} // namespace project::git
