#include "cli/CommandText.hpp"

#include <string_view>
#include <utility>

#include "cli/CodedFailure.hpp"

namespace projectctl {

namespace {

constexpr std::string_view blanks = " \t";

/// The bytes that a backslash quotes between double quotes.
constexpr std::string_view quotable = "$`\"\\";

} // namespace

CommandText::CommandText(std::string text) : text_(std::move(text)) {
}

std::optional<CommandText::Line> CommandText::next() {
    Line result{};
    for (skipBlanks(); !isAtEnd(); skipBlanks()) {
        if (isAt('\n')) {
            take();
            if (!result.words.empty()) {
                return result;
            }
        } else if (isAt('#')) {
            skipComment();
        } else {
            result.number = result.words.empty() ? line_ : result.number;
            result.words.push_back(takeWord());
        }
    }
    return result.words.empty() ? std::nullopt : std::optional(std::move(result));
}

bool CommandText::isAtWord() const noexcept {
    return !isAtEnd() && text_[at_] != '\n' && blanks.find(text_[at_]) == std::string_view::npos;
}

char CommandText::take() {
    auto const byte = text_[at_++];
    if (byte == '\0') {
        fail(line_, "ZeroByte");
    }
    line_ += byte == '\n' ? 1 : 0;
    return byte;
}

void CommandText::skipBlanks() {
    while (!isAtEnd()) {
        if (blanks.find(text_[at_]) != std::string_view::npos) {
            take();
        } else if (text_.compare(at_, 2, "\\\n") == 0) {
            take();
            take();
        } else {
            return;
        }
    }
}

void CommandText::skipComment() {
    while (!isAtEnd() && !isAt('\n')) {
        take();
    }
}

std::string CommandText::takeWord() {
    std::string result;
    while (isAtWord()) {
        char const byte = take();
        if (byte == '\'') {
            takeSingleQuoted(result);
        } else if (byte == '"') {
            takeDoubleQuoted(result);
        } else if (byte == '\\') {
            takeEscaped(result);
        } else {
            result += byte;
        }
    }
    return result;
}

void CommandText::takeEscaped(std::string& word) {
    if (isAtEnd()) {
        fail(line_, "NothingBehindBackslash");
    }
    char const byte = take();
    if (byte != '\n') {
        word += byte;
    }
}

void CommandText::takeSingleQuoted(std::string& word) {
    std::size_t const begin = line_;
    while (!isAtEnd()) {
        char const byte = take();
        if (byte == '\'') {
            return;
        }
        word += byte;
    }
    fail(begin, "SingleQuoteOpen");
}

void CommandText::takeDoubleQuoted(std::string& word) {
    std::size_t const begin = line_;
    while (!isAtEnd()) {
        char const byte = take();
        if (byte == '"') {
            return;
        }
        if (byte == '\\' && !isAtEnd() &&
            (isAt('\n') || quotable.find(text_[at_]) != std::string_view::npos)) {
            takeEscaped(word);
        } else {
            word += byte;
        }
    }
    fail(begin, "DoubleQuoteOpen");
}

void CommandText::fail(std::size_t line, char const* problem) {
    throw WrongUse(atLine(line, Message(problem).text()));
}

Message atLine(std::size_t number, std::string const& problem) {
    return Message("AtLine", std::to_string(number), problem);
}

} // namespace projectctl
