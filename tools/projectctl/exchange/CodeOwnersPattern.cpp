#include "exchange/CodeOwnersPattern.hpp"

namespace projectctl {

namespace {

constexpr std::string_view anyFolders = "**";

/// The number of bytes of the first character.
std::size_t lengthOfCharacter(std::string_view text) {
    std::size_t result = 1;
    while (result < text.size() && (static_cast<unsigned char>(text[result]) & 0xC0U) == 0x80U) {
        ++result;
    }
    return result;
}

/// The rest of a pattern and of a name, while they are compared.
struct Rest {
    std::string_view pattern;
    std::string_view name;

    /// Passes one character, unless the pattern begins with a star.
    bool pass() {
        if (pattern.empty() || name.empty()) {
            return false;
        }
        if (pattern.front() == '?') {
            pattern.remove_prefix(1);
            name.remove_prefix(lengthOfCharacter(name));
            return true;
        }
        pattern.remove_prefix(pattern.front() == '\\' && pattern.size() > 1 ? 1 : 0);
        bool const isEqual = pattern.front() == name.front();
        pattern.remove_prefix(1);
        name.remove_prefix(1);
        return isEqual;
    }
};

/// Matches a name with a pattern that has *, ? and backslashes. If something behind a star does not match,
/// only the last star has to take more.
bool matchesName(std::string_view pattern, std::string_view name) {
    Rest rest{pattern, name};
    Rest afterStar{};
    bool hasStar = false;
    while (!rest.name.empty() || !rest.pattern.empty()) {
        if (rest.pattern.starts_with('*')) {
            rest.pattern.remove_prefix(1);
            afterStar = rest;
            hasStar = true;
        } else if (!rest.pass()) {
            if (!hasStar || afterStar.name.empty()) {
                return false;
            }
            afterStar.name.remove_prefix(1);
            rest = afterStar;
        }
    }
    return true;
}

} // namespace

std::vector<std::string_view> namesIn(std::string_view path) {
    std::vector<std::string_view> result;
    for (std::size_t slash = 0; slash != std::string_view::npos;) {
        slash = path.find('/');
        result.push_back(path.substr(0, slash));
        path.remove_prefix(slash == std::string_view::npos ? path.size() : slash + 1);
    }
    return result;
}

CodeOwnersPattern::CodeOwnersPattern(std::string_view text) {
    bool const isFromRoot = text.starts_with('/');
    text.remove_prefix(isFromRoot ? 1 : 0);
    isOfFolders_ = text.ends_with('/');
    text.remove_suffix(isOfFolders_ ? 1 : 0);
    for (auto const name : namesIn(text)) {
        names_.emplace_back(name);
    }
    bool const isName = names_.size() == 1 && !isFromRoot;
    matchesBelow_ = isName || names_.back() != "*";
    if (isName) {
        names_.emplace(names_.begin(), anyFolders);
    }
}

bool CodeOwnersPattern::matchesFrom(std::size_t name, std::vector<std::string_view> const& path,
                                    std::size_t at) const {
    if (name == names_.size()) {
        return at == path.size() ? !isOfFolders_ : matchesBelow_;
    }
    if (names_[name] == anyFolders) {
        bool const isLast = name + 1 == names_.size();
        for (std::size_t next = isLast ? at + 1 : at; next <= path.size();
             ++next) { // at the end: something below
            if (matchesFrom(name + 1, path, next)) {
                return true;
            }
        }
        return false;
    }
    return at < path.size() && matchesName(names_[name], path[at]) && matchesFrom(name + 1, path, at + 1);
}

} // namespace projectctl
