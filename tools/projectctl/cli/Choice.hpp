#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace projectctl {

/// A thing that users refer to by its name, and the project by its UUID.
struct Named {
    std::u16string name;
    std::u16string uuid;
};

/// The names of categories, of labels, or of other things with these two getters.
template <typename Thing>
std::vector<Named> namesOf(std::vector<Thing> const& things) {
    std::vector<Named> result;
    result.reserve(things.size());
    for (auto const& thing : things) {
        result.push_back({thing.getName(), thing.getUUID()});
    }
    return result;
}

/// Finds the thing that an argument names: the one with that name, else the one with that UUID.
/// @param several the message for several things with the name.
/// @return its index; empty when there is none.
/// @throws Failure when several things have the name. The text lists their UUIDs.
std::optional<std::size_t> choose(std::vector<Named> const& things, std::u16string const& wanted,
                                  char const* several);

/// Whether a text has the form of a UUID: 36 characters, hexadecimal digits and dashes.
bool isUUID(std::u16string const& text);

} // namespace projectctl
