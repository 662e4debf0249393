#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace projectctl {

/// Something that people call by its name and the project by its UUID.
struct Named {
    std::u16string name;
    std::u16string uuid;
};

/// Which of several things an argument means: the one of that name, or else the one of that UUID.
/// @param kind what they are, in the plural, for the error.
/// @return its index; none when there is no such thing.
/// @throws Failure when several bear the name; it lists them with their UUIDs.
std::optional<std::size_t> choose(std::vector<Named> const& things, std::u16string const& wanted,
                                  std::string const& kind);

/// Whether a text has the form of a UUID: 36 characters, hexadecimal digits and dashes.
bool isUUID(std::u16string const& text);

} // namespace projectctl
