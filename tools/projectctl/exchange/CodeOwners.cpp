#include "exchange/CodeOwners.hpp"

#include <algorithm>
#include <utility>

namespace projectctl {

namespace {

bool isBlank(char byte) {
    return byte == ' ' || byte == '\t';
}

/// The next word of a line; a backslash quotes a blank. The backslashes stay in the word.
std::string_view takeWordOf(std::string_view& rest) {
    while (!rest.empty() && isBlank(rest.front())) {
        rest.remove_prefix(1);
    }
    std::size_t end = 0;
    while (end < rest.size() && !isBlank(rest[end])) {
        end += rest[end] == '\\' && end + 1 < rest.size() ? 2 : 1;
    }
    std::string_view const word = rest.substr(0, end);
    rest.remove_prefix(end);
    return word;
}

} // namespace

CodeOwners::CodeOwners(std::string_view text) {
    for (std::size_t number = 1; !text.empty(); ++number) {
        std::size_t const end = std::min(text.find('\n'), text.size());
        auto line = text.substr(0, end);
        line.remove_suffix(line.ends_with('\r') ? 1 : 0);
        readLine(number, line);
        text.remove_prefix(std::min(end + 1, text.size()));
    }
}

void CodeOwners::readLine(std::size_t number, std::string_view line) {
    std::string_view const pattern = takeWordOf(line);
    if (pattern.empty() || pattern.front() == '#') {
        return;
    }
    Rule rule{number, CodeOwnersPattern(pattern), {}};
    for (auto word = takeWordOf(line); !word.empty() && word.front() != '#'; word = takeWordOf(line)) {
        if (!isCodeOwner(word)) {
            badLines_.push_back({number, Message("NotAnOwner", word)});
            return;
        }
        rule.owners.emplace_back(word);
    }
    if (pattern.front() == '!') {
        badLines_.push_back({number, Message("PatternNegated")});
        return;
    }
    rules_.push_back(std::move(rule));
}

CodeOwners::Rule const* CodeOwners::ruleOf(std::u16string_view path) const {
    auto const found = std::find_if(rules_.rbegin(), rules_.rend(),
                                    [path](Rule const& rule) { return rule.pattern.matches(path); });
    return found != rules_.rend() ? &*found : nullptr;
}

bool isCodeOwner(std::string_view text) {
    return text.find('@') != std::string_view::npos &&
           text.find_first_of(" \t\r\n\\") == std::string_view::npos && !text.starts_with('#');
}

std::optional<std::string> codeOwnersLine(std::string_view path, std::vector<std::string> const& owners) {
    if (path.find('\n') != std::string_view::npos) {
        return std::nullopt;
    }
    std::string result = "/";
    for (char const byte : path) {
        constexpr std::string_view special = " \t\\*?";
        result += special.find(byte) != std::string_view::npos ? "\\" : "";
        result += byte;
    }
    for (auto const& owner : owners) {
        result += ' ' + owner;
    }
    return result + '\n';
}

} // namespace projectctl
