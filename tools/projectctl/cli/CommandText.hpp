#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "texts/Message.hpp"

namespace projectctl {

/// A text with one command per line, whose words are quoted as in a shell:
///
/// - Blanks and tabs separate words.
/// - Between single quotes, each byte means itself, also a line end.
/// - Between double quotes, a backslash quotes $, `, ", a backslash, and a line end, which it removes. In
/// front of
///   another byte, it means itself.
/// - Outside of quotes, a backslash quotes the next byte, and removes a line end.
/// - A word that begins with # begins a comment, which ends with the line.
///
/// Nothing is expanded, and no other byte is special.
class CommandText {
public:
    struct Line {
        std::size_t number; ///< of the line in which the command begins, from 1
        std::vector<std::string> words;
    };

    explicit CommandText(std::string text);

    /// @return the next command, with at least one word; empty at the end of the text.
    /// @throws WrongUse with the number of the line, for a quote that is not closed, a backslash at the end
    /// of the
    ///         text, and a zero byte.
    std::optional<Line> next();

private:
    bool isAtEnd() const noexcept { return at_ == text_.size(); }

    bool isAt(char byte) const noexcept { return !isAtEnd() && text_[at_] == byte; }

    bool isAtWord() const noexcept;
    char take();
    void skipBlanks();
    void skipComment();
    std::string takeWord();
    void takeEscaped(std::string& word);
    void takeSingleQuoted(std::string& word);
    void takeDoubleQuoted(std::string& word);
    [[noreturn]] static void fail(std::size_t line, char const* problem);

    std::string text_;
    std::size_t at_ = 0;
    std::size_t line_ = 1;
};

/// An error about a line.
Message atLine(std::size_t number, std::string const& problem);

} // namespace projectctl
