#include "Glob.hpp"

#include <algorithm>
#include <utility>

namespace project::session {

namespace {

constexpr std::size_t none = std::u16string_view::npos;

/// Removes and returns the first character. A surrogate without its partner, which stands for a byte that is
/// not valid UTF-8, is a character of its own.
char32_t takeCharacter(std::u16string_view& text) noexcept {
    char32_t const first = text.front();
    text.remove_prefix(1);
    bool const isPair =
        first >= 0xD800 && first < 0xDC00 && !text.empty() && text.front() >= 0xDC00 && text.front() < 0xE000;
    if (!isPair) {
        return first;
    }
    char32_t const second = text.front();
    text.remove_prefix(1);
    return 0x10000 + ((first - 0xD800) << 10U) + (second - 0xDC00);
}

/// Removes and returns the first element and the separator behind it.
std::u16string_view takeElement(std::u16string_view& path) noexcept {
    auto const end = std::min(path.find(u'/'), path.size());
    auto const result = path.substr(0, end);
    path.remove_prefix(std::min(end + 1, path.size()));
    return result;
}

} // namespace

Glob::Glob(std::u16string_view pattern) {
    for (std::size_t from = 0; from <= pattern.size();) {
        // A separator that is quoted, or between brackets, separates elements as well: no name contains one.
        auto const end = std::min(pattern.find(u'/', from), pattern.size());
        elements_.push_back(elementOf(pattern.substr(from, end - from)));
        from = end + 1;
    }
}

Glob::Element Glob::elementOf(std::u16string_view pattern) {
    Element result;
    result.isAnyElements = pattern == u"**";
    while (!result.isAnyElements && !pattern.empty()) {
        auto sign = takeSign(pattern);
        bool const isRepeated =
            sign.kind == Kind::AnyText && !result.signs.empty() && result.signs.back().kind == Kind::AnyText;
        if (!isRepeated) {
            result.signs.push_back(std::move(sign));
        }
    }
    return result;
}

Glob::Sign Glob::takeSign(std::u16string_view& pattern) {
    auto const character = takeCharacter(pattern);
    Sign result{Kind::Literal, character, {}};
    if (character == U'*') {
        result.kind = Kind::AnyText;
    } else if (character == U'?') {
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

bool Glob::Sign::isMatch(char32_t character) const noexcept {
    if (kind == Kind::Literal) {
        return character == literal;
    }
    bool const isListed = std::ranges::any_of(ranges, [character](Range const& range) {
        return range.first <= character && character <= range.last;
    });
    return kind == Kind::AnyCharacter || isListed == (kind == Kind::Characters);
}

/// After a mismatch, only the most recent `*` needs to match more: an earlier one can be left as it is.
bool Glob::Element::isMatch(std::u16string_view name) const noexcept {
    std::size_t next = 0;
    std::size_t star = none;
    std::u16string_view afterStar;
    while (!name.empty() || next < signs.size()) {
        if (next < signs.size() && signs[next].kind == Kind::AnyText) {
            star = next++;
            afterStar = name;
            continue;
        }
        if (next < signs.size() && !name.empty() && signs[next].isMatch(takeCharacter(name))) {
            ++next;
            continue;
        }
        if (star == none || afterStar.empty()) {
            return false;
        }
        takeCharacter(afterStar);
        name = afterStar;
        next = star + 1;
    }
    return true;
}

/// The same over elements: `**` is to them as `*` is to characters.
bool Glob::isMatch(std::u16string_view path) const noexcept {
    std::size_t next = 0;
    std::size_t star = none;
    std::u16string_view afterStar;
    while (!path.empty() || next < elements_.size()) {
        if (next < elements_.size() && elements_[next].isAnyElements) {
            star = next++;
            afterStar = path;
            // At the end of a pattern it matches what is below a folder, and not the folder itself.
            if (next == elements_.size()) {
                return !path.empty();
            }
            continue;
        }
        if (next < elements_.size() && !path.empty() && elements_[next].isMatch(takeElement(path))) {
            ++next;
            continue;
        }
        if (star == none || afterStar.empty()) {
            return false;
        }
        takeElement(afterStar);
        path = afterStar;
        next = star + 1;
    }
    return true;
}

} // namespace project::session
