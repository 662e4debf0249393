#pragma once

#include <cstddef>
#include <ostream>
#include <string>
#include <vector>

namespace project::test {

/// A kind of text that an attacker could use to exhaust a reader: valid, partly valid or nonsense.
struct HostileText {
    char const* name;

    /// A text with this number of hostile elements.
    std::string (*make)(std::size_t count);

    friend void PrintTo(HostileText const& text, std::ostream* out) { *out << text.name; }
};

std::vector<HostileText> const& hostileTexts();

} // namespace project::test
