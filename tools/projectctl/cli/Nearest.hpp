#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "cli/Choice.hpp"

namespace projectctl {

/// Finds the name that a user probably meant: the one with the fewest characters that are missing,
/// superfluous, wrong or exchanged with their neighbour, or one that begins with the given text.
/// @return empty if no name is near enough.
std::optional<std::u16string> nearest(std::u16string_view wanted, std::vector<std::u16string> const& names);

/// The same for the names of things.
std::optional<std::u16string> nearest(std::u16string_view wanted, std::vector<Named> const& things);

/// The same for texts in UTF-8.
std::optional<std::string> nearest(std::string const& wanted, std::vector<std::string> const& names);

} // namespace projectctl
