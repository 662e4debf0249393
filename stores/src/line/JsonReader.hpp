#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "line/JsonText.hpp"

namespace project::stores {

/// Reads one JSON value strictly, member by member, in the order in which the caller expects them.
///
/// After the first error, every operation returns false, and problem returns the name of its text. The text
/// must outlive the reader. Reading allocates nothing.
class JsonReader {
public:
    explicit JsonReader(std::string_view text) noexcept : text_(text) {}

    /// Consumes a character that must come next, after optional white space.
    bool expect(char character) noexcept;

    /// Consumes a character if it comes next.
    bool accept(char character) noexcept;

    /// True if a character comes next.
    bool isNext(char character) noexcept { return peek() == character; }

    /// Consumes a string. @param content receives the bytes between its quotes.
    bool string(std::string_view& content) noexcept;

    /// Consumes a word such as false.
    bool word(std::string_view expected) noexcept;

    /// Consumes a whole number without sign, fraction and exponent.
    bool number(unsigned long& value) noexcept;

    /// True at the end of the text. Anything that follows is an error.
    bool end() noexcept;

    /// Records an error that the caller found. @param problem the name of its text. @return false.
    bool fail(char const* problem) noexcept;

    /// The name of the text of the first error, or null.
    char const* problem() const noexcept { return problem_; }

    /// The text of the first error, in the language of the process; empty if there is none.
    std::string problemText() const;

private:
    /// Skips white space. @return the next character, or 0 at the end and after an error.
    char peek() noexcept;

    std::string_view text_;
    std::size_t at_ = 0;
    char const* problem_ = nullptr;
};

} // namespace project::stores
