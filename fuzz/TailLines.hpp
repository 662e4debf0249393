#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace project::fuzz {

/// Behind a body, what an input means by its lines. A line "#" closes a batch rightly: with the number of its
/// lines, the sum before it, and its own. So a fuzzer gets past the checksums, which it could never guess.
/// "#!" closes one that does not name the sum before it, "#?" one whose own sum is wrong, and "#" with a
/// number one that claims to have so many lines. All else stands as it is.
/// @return pieces of the tail one behind the other, each but perhaps the last one up to a closing line.
std::vector<std::string> tailOf(std::string_view input, std::string_view body);

} // namespace project::fuzz
