#include "Glob.hpp"

#include <algorithm>
#include <utility>

namespace project::session {

namespace {

constexpr std::size_t none = std::u16string_view::npos;

bool isPair(char16_t first, char16_t second) noexcept {
    return first >= 0xD800 && first < 0xDC00 && second >= 0xDC00 && second < 0xE000;
}

/// Removes and returns the first character. A surrogate without its partner, which stands for a byte that is
/// not valid UTF-8, is a character of its own.
char32_t takeCharacter(std::u16string_view& text) noexcept {
    char16_t const first = text.front();
    text.remove_prefix(1);
    if (text.empty() || !isPair(first, text.front())) {
        return first;
    }
    char32_t const second = text.front();
    text.remove_prefix(1);
    return 0x10000 + ((char32_t(first) - 0xD800) << 10U) + (second - 0xDC00);
}

} // namespace

Glob::Glob(std::u16string_view pattern) : elements_(1) {
    for (std::size_t from = 0; from <= pattern.size();) {
        // A separator that is quoted, or between brackets, separates elements as well: no name contains one.
        auto const end = std::min(pattern.find(u'/', from), pattern.size());
        auto const element = pattern.substr(from, end - from);
        if (element == u"**") {
            elements_.emplace_back();
        } else {
            elements_.back().push_back(elementOf(element));
        }
        from = end + 1;
    }
    if (elements_.size() > 1 && elements_.back().empty()) {
        elements_.back().push_back(
            elementOf(u"*")); // at the end, ** matches below a folder and not the folder
    }
}

Glob::Element Glob::elementOf(std::u16string_view pattern) {
    Element result{{{}}};
    while (!pattern.empty()) {
        if (pattern.front() == u'*') {
            pattern.remove_prefix(1);
            result.signs.emplace_back();
        } else {
            result.signs.back().push_back(takeSign(pattern));
        }
    }
    return result;
}

Glob::Sign Glob::takeSign(std::u16string_view& pattern) {
    auto const character = takeCharacter(pattern);
    Sign result{Kind::Literal, character, {}};
    if (character == U'?') {
        result.kind = Kind::AnyCharacter;
    } else if (character == U'\\' && !pattern.empty()) {
        result.literal = takeCharacter(pattern);
    } else if (character == U'[') {
        takeCharacters(pattern, result);
    }
    return result;
}

/// Removes the rest of "[...]". @return false, with nothing removed, if the closing bracket is missing.
bool Glob::takeCharacters(std::u16string_view& pattern, Sign& sign) {
    auto rest = pattern;
    bool const isNegated = !rest.empty() && (rest.front() == u'!' || rest.front() == u'^');
    rest.remove_prefix(isNegated ? 1 : 0);
    std::vector<Range> ranges;
    while (!rest.empty() && (ranges.empty() || rest.front() != u']')) {
        auto const take = [&rest] {
            auto const character = takeCharacter(rest);
            return character == U'\\' && !rest.empty() ? takeCharacter(rest) : character;
        };
        auto const first = take();
        bool const isRange = rest.size() > 1 && rest[0] == u'-' && rest[1] != u']';
        rest.remove_prefix(isRange ? 1 : 0);
        ranges.push_back({first, isRange ? take() : first});
    }
    if (rest.empty()) {
        return false;
    }
    pattern = rest.substr(1);
    sign.kind = isNegated ? Kind::OtherCharacters : Kind::Characters;
    sign.ranges = std::move(ranges);
    return true;
}

bool Glob::Sign::take(std::u16string_view& text) const noexcept {
    auto const character = takeCharacter(text);
    if (kind == Kind::Literal) {
        return character == literal;
    }
    bool const isListed = std::ranges::any_of(ranges, [character](Range const& range) {
        return range.first <= character && character <= range.last;
    });
    return kind == Kind::AnyCharacter || isListed == (kind == Kind::Characters);
}

void Glob::Sign::approach(std::u16string_view& text) const noexcept {
    bool const isOneUnit = literal < 0xD800 || (literal >= 0xE000 && literal < 0x10000);
    if (kind == Kind::Literal && isOneUnit) {
        text.remove_prefix(std::min(text.find(static_cast<char16_t>(literal)), text.size()));
    }
}

void Glob::Sign::skip(std::u16string_view& text) noexcept {
    takeCharacter(text);
}

void Glob::Sign::skipLast(std::u16string_view& text) noexcept {
    bool const endsWithPair = text.size() > 1 && isPair(text[text.size() - 2], text.back());
    text.remove_suffix(endsWithPair ? 2 : 1);
}

bool Glob::Element::take(std::u16string_view& path) const noexcept {
    auto const name = path.substr(0, path.find(u'/'));
    path.remove_prefix(std::min(name.size() + 1, path.size()));
    return Glob::isMatch(signs, name);
}

void Glob::Element::skip(std::u16string_view& path) noexcept {
    path.remove_prefix(std::min(path.find(u'/'), path.size() - 1) + 1);
}

void Glob::Element::skipLast(std::u16string_view& path) noexcept {
    path.remove_suffix(path.back() == u'/' ? 1 : 0); // of the element that was removed before
    auto const slash = path.rfind(u'/');
    path = path.substr(0, slash == none ? 0 : slash + 1);
}

/// Whether parts match the first pieces of a text, which are removed.
template <typename Part>
bool Glob::isTaken(std::vector<Part> const& parts, std::u16string_view& text) noexcept {
    return std::ranges::all_of(parts, [&text](Part const& part) { return !text.empty() && part.take(text); });
}

/// Searches the first place at which parts match. Removes everything up to the end of them.
template <typename Part>
bool Glob::isFound(std::vector<Part> const& parts, std::u16string_view& text) noexcept {
    while (!parts.empty()) {
        parts.front().approach(text);
        auto rest = text;
        if (isTaken(parts, rest)) {
            text = rest;
            break;
        }
        if (text.empty()) {
            return false;
        }
        Part::skip(text);
    }
    return true;
}

/// Compares a text with runs of parts, with any pieces between the runs: the first run is at its begin, the
/// last one at its end, and each of the others at the first place at which it matches.
template <typename Part>
bool Glob::isMatch(std::vector<std::vector<Part>> const& runs, std::u16string_view text) noexcept {
    if (!isTaken(runs.front(), text)) {
        return false;
    }
    if (runs.size() == 1) {
        return text.empty();
    }
    for (std::size_t run = 1; run + 1 < runs.size(); ++run) {
        if (!isFound(runs[run], text)) {
            return false;
        }
    }
    auto before = text;
    for (std::size_t count = 0; count < runs.back().size(); ++count) {
        if (before.empty()) {
            return false;
        }
        Part::skipLast(before);
    }
    text.remove_prefix(before.size());
    return isTaken(runs.back(), text);
}

bool Glob::isMatch(std::u16string_view path) const noexcept {
    return isMatch(elements_, path);
}

} // namespace project::session
