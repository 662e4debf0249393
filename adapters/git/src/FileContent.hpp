#pragma once

#include <cstddef>
#include <optional>
#include <string>

namespace project::git {

/// All bytes of a regular file. Nothing, with errno, when it can't be read or a link stands there.
/// @param expectedSize how many there will be, if the caller knows.
std::optional<std::string> readFile(std::string const& name, std::size_t expectedSize = 4095);

/// What a symbolic link leads to. Nothing, with errno, when it can't be read.
std::optional<std::string> readLink(std::string const& name);

} // namespace project::git
