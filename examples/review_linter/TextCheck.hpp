#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace review_linter {

/// A place at which a text breaks a rule.
struct Finding {
    std::size_t line; ///< counted from 1
    std::string problem;
};

/// Checks a text against the rules: no tabs, no blanks at the end of a line, and a line end after the last
/// line.
std::vector<Finding> check(std::string_view text);

/// A number that is different for different texts, as far as accidents are concerned. Somebody who wants two
/// texts with the same number can find them.
std::uint64_t hashOf(std::string_view text) noexcept;

} // namespace review_linter
