#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "exchange/CodeOwnersPattern.hpp"
#include "texts/Message.hpp"

namespace projectctl {

/// The rules of a CODEOWNERS file. Each line is a pattern and its owners; the last pattern that matches a
/// file decides.
class CodeOwners {
public:
    struct Rule {
        std::size_t line; ///< from 1
        CodeOwnersPattern pattern;
        std::vector<std::string> owners; ///< @user, @organisation/team, or an address; may be empty
    };

    /// A line that is not a rule.
    struct BadLine {
        std::size_t line;
        Message problem;
    };

    explicit CodeOwners(std::string_view text);

    /// The rule for a file. @param path relative to the root. @return null if no pattern matches.
    Rule const* ruleOf(std::u16string_view path) const;

    std::vector<BadLine> const& badLines() const noexcept { return badLines_; }

private:
    void readLine(std::size_t number, std::string_view line);

    std::vector<Rule> rules_;
    std::vector<BadLine> badLines_;
};

/// Whether a text can be an owner.
bool isCodeOwner(std::string_view text);

/// The line of one file: a pattern that matches this file only, and its owners.
/// @return empty if the path has a line end, which no pattern can contain.
std::optional<std::string> codeOwnersLine(std::string_view path, std::vector<std::string> const& owners);

} // namespace projectctl
