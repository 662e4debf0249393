#pragma once

#include <cstddef>
#include <string_view>

#include "line/JsonText.hpp"

namespace project::stores {

/// Walks through one JSON value, strictly, member by member as its caller expects them.
///
/// After the first thing that is wrong every operation answers false and problem tells what it was. Works on
/// the bytes given, which must outlive it; allocates nothing.
class JsonReader {
public:
    explicit JsonReader(std::string_view text) noexcept : text_(text) {}

    /// Passes a character that must come next, white space before it left aside.
    bool expect(char character) noexcept;

    /// Passes a character if it comes next.
    bool accept(char character) noexcept;

    /// True when a character comes next.
    bool isNext(char character) noexcept { return peek() == character; }

    /// Passes a string. @param content is given what stands between its quotes.
    bool string(std::string_view& content) noexcept;

    /// Passes a word such as false.
    bool word(std::string_view expected) noexcept;

    /// Passes a whole number without sign, fraction and exponent.
    bool number(unsigned long& value) noexcept;

    /// True at the end of the text; anything left there is wrong.
    bool end() noexcept;

    /// Notes a problem of the caller's. @return false.
    bool fail(char const* problem) noexcept;

    /// What was wrong first, or null.
    char const* problem() const noexcept { return problem_; }

private:
    /// Leaves white space aside. @return the next character, or 0 at the end and after a problem.
    char peek() noexcept;

    std::string_view text_;
    std::size_t at_ = 0;
    char const* problem_ = nullptr;
};

} // namespace project::stores
