#include "rules/AttributeLine.hpp"

#include <algorithm>
#include <cctype>
#include <utility>

namespace project::git {

namespace {

constexpr std::string_view blanks = " \t\r\n";
constexpr std::string_view macroSign = "[attr]";

void skipBlanks(std::string_view& text) {
    text.remove_prefix(std::min(text.find_first_not_of(blanks), text.size()));
}

std::string_view takeWord(std::string_view& text) {
    std::string_view const word = text.substr(0, text.find_first_of(blanks));
    text.remove_prefix(word.size());
    return word;
}

/// Takes three octal digits, the first of which is at most 3; nothing when there are fewer.
std::optional<char> takeOctal(std::string_view& text) {
    unsigned value = 0;
    for (auto const digit : text.substr(0, 3)) {
        if (digit < '0' || digit > '7') {
            return std::nullopt;
        }
        value = value * 8 + static_cast<unsigned>(digit - '0');
    }
    if (text.size() < 3) {
        return std::nullopt;
    }
    text.remove_prefix(3);
    return static_cast<char>(value);
}

/// Takes what follows a backslash; nothing when git does not know it.
std::optional<char> takeEscaped(std::string_view& text) {
    constexpr std::string_view letters = "abfnrtv\\\"";
    constexpr std::string_view meanings = "\a\b\f\n\r\t\v\\\"";
    if (!text.empty() && text[0] >= '0' && text[0] <= '3') {
        return takeOctal(text);
    }
    std::size_t const known = text.empty() ? std::string_view::npos : letters.find(text[0]);
    if (known == std::string_view::npos) {
        return std::nullopt;
    }
    text.remove_prefix(1);
    return meanings[known];
}

char takeFirst(std::string_view& text) {
    auto const result = text[0];
    text.remove_prefix(1);
    return result;
}

/// A pattern in quotes, written as in C; nothing when it is not well-formed, and then the quotes belong to
/// the pattern.
std::optional<std::string> takeQuoted(std::string_view& text) {
    if (!text.starts_with('"')) {
        return std::nullopt;
    }
    std::string_view rest = text.substr(1);
    std::string result;
    while (!rest.empty() && rest[0] != '"') {
        auto const sign = takeFirst(rest);
        auto const meant = sign == '\\' ? takeEscaped(rest) : sign;
        if (!meant) {
            return std::nullopt;
        }
        result += *meant;
    }
    if (rest.empty()) {
        return std::nullopt;
    }
    text = rest.substr(1);
    return result;
}

bool isAttributeName(std::string_view name) {
    auto const isAllowed = [](char sign) {
        return std::isalnum(static_cast<unsigned char>(sign)) != 0 || sign == '-' || sign == '_' ||
               sign == '.';
    };
    return !name.empty() && name[0] != '-' && std::all_of(name.begin(), name.end(), isAllowed);
}

std::optional<AttributeState> readState(std::string_view word) {
    using Kind = AttributeValue::Kind;
    std::size_t const equals = word.find('=');
    std::string_view name = word.substr(0, equals);
    AttributeValue value{Kind::Set};
    if (name.starts_with('-') || name.starts_with('!')) {
        value.kind = name[0] == '-' ? Kind::Unset : Kind::Unspecified;
        name.remove_prefix(1);
    } else if (equals != std::string_view::npos) {
        value = {Kind::Text, std::string(word.substr(equals + 1))};
    }
    return isAttributeName(name) ? std::optional(AttributeState{std::string(name), std::move(value)})
                                 : std::nullopt;
}

} // namespace

std::optional<AttributeLine> AttributeLine::read(std::string_view line) {
    skipBlanks(line);
    if (line.empty() || line[0] == '#') {
        return std::nullopt;
    }
    AttributeLine result;
    auto const quoted = takeQuoted(line);
    std::string const text = quoted ? *quoted : std::string(takeWord(line));
    if (text.starts_with(macroSign) && text.size() > macroSign.size()) {
        auto name = std::string_view(text).substr(macroSign.size());
        skipBlanks(name);
        result.macro = takeWord(name);
        if (!isAttributeName(result.macro)) {
            return std::nullopt;
        }
    } else {
        result.pattern = text.starts_with('!') ? std::nullopt : NamePattern::of(text);
    }
    for (skipBlanks(line); !line.empty(); skipBlanks(line)) {
        auto state = readState(takeWord(line));
        if (!state) {
            return std::nullopt;
        }
        result.states.push_back(*std::move(state)); // NOLINT: their number is not known before
    }
    return result;
}

std::vector<AttributeLine> readAttributeLines(std::string_view text) {
    if (text.starts_with("\xEF\xBB\xBF")) {
        text.remove_prefix(3);
    }
    std::vector<AttributeLine> result;
    while (!text.empty()) {
        std::size_t const end = std::min(text.find('\n'), text.size());
        if (auto line = AttributeLine::read(text.substr(0, end))) {
            result.push_back(*std::move(line)); // NOLINT: their number is not known before
        }
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return result;
}

} // namespace project::git
