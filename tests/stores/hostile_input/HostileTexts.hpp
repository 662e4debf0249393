#pragma once

#include <cstddef>
#include <ostream>
#include <string>
#include <vector>

namespace project::test {

/// A kind of text that somebody could make to wear a reader out: valid, half valid or nonsense.
struct HostileText {
    char const* name;

    /// A text with so many of what makes it hostile.
    std::string (*make)(std::size_t count);

    friend void PrintTo(HostileText const& text, std::ostream* out) { *out << text.name; }
};

std::vector<HostileText> const& hostileTexts();

} // namespace project::test
