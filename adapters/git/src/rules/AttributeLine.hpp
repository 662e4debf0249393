#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "rules/NamePattern.hpp"

namespace project::git {

/// The value of an attribute.
struct AttributeValue {
    enum class Kind { Unspecified, Set, Unset, Text };

    Kind kind = Kind::Unspecified;
    std::string text{}; ///< for Kind::Text

    bool operator==(AttributeValue const&) const = default;
};

struct AttributeState {
    std::string name;
    AttributeValue value;
};

/// One line of a `.gitattributes` (gitattributes(5)): attributes for a pattern, or the definition of a macro.
struct AttributeLine {
    /// Nothing for a line that git ignores.
    static std::optional<AttributeLine> read(std::string_view line);

    std::optional<NamePattern> pattern{};
    std::string macro{};
    std::vector<AttributeState> states{};
};

/// The lines of a file, without those that git ignores.
std::vector<AttributeLine> readAttributeLines(std::string_view text);

} // namespace project::git
