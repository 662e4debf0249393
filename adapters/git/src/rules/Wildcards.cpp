#include "rules/Wildcards.hpp"

#include <algorithm>
#include <array>
#include <cctype>
#include <optional>
#include <vector>

namespace project::git {

namespace {

using Byte = unsigned char;

struct NamedClass {
    std::string_view name;
    int (*contains)(int);
};

constexpr std::array<NamedClass, 12> namedClasses{{{"alnum", std::isalnum},
                                                   {"alpha", std::isalpha},
                                                   {"blank", std::isblank},
                                                   {"cntrl", std::iscntrl},
                                                   {"digit", std::isdigit},
                                                   {"graph", std::isgraph},
                                                   {"lower", std::islower},
                                                   {"print", std::isprint},
                                                   {"punct", std::ispunct},
                                                   {"space", std::isspace},
                                                   {"upper", std::isupper},
                                                   {"xdigit", std::isxdigit}}};

/// Reads "[...]" and determines whether it contains a byte.
class BracketReader {
public:
    /// @param at the position behind the opening bracket.
    BracketReader(std::string_view pattern, std::size_t at, bool isCaseIgnored)
        : pattern_(pattern), at_(at), isCaseIgnored_(isCaseIgnored) {}

    /// Nothing if the bracket is not closed or names an unknown class.
    std::optional<bool> contains(Byte byte) {
        bool const isNegated = isAt('!') || isAt('^');
        at_ += isNegated ? 1 : 0;
        bool isFirst = true;
        bool isHeld = false;
        while (at_ < pattern_.size() && (isFirst || pattern_[at_] != ']')) {
            auto const held = pattern_.substr(at_, 2) == "[:" ? containsNamed(byte) : containsRange(byte);
            if (!held) {
                return std::nullopt;
            }
            isHeld = isHeld || *held;
            isFirst = false;
        }
        if (at_ >= pattern_.size()) {
            return std::nullopt;
        }
        ++at_;
        return isHeld != isNegated;
    }

    /// The position behind the closing bracket.
    std::size_t end() const { return at_; }

private:
    bool isAt(char sign) const { return at_ < pattern_.size() && pattern_[at_] == sign; }

    std::optional<bool> containsNamed(Byte byte) {
        std::size_t const close = pattern_.find(']', at_ + 2);
        if (close == std::string_view::npos) {
            return std::nullopt;
        }
        if (pattern_[close - 1] != ':' || close < at_ + 3) {
            return containsRange(byte); // not a name: the bracket is one of the characters
        }
        std::string_view const name = pattern_.substr(at_ + 2, close - at_ - 3);
        at_ = close + 1;
        auto const* const found = std::find_if(namedClasses.begin(), namedClasses.end(),
                                               [&](NamedClass const& known) { return known.name == name; });
        if (found == namedClasses.end()) {
            return std::nullopt;
        }
        return found->contains(byte) != 0 || (isCaseIgnored_ && name == "upper" && std::islower(byte) != 0);
    }

    std::optional<bool> containsRange(Byte byte) {
        auto const first = readSign();
        if (!first) {
            return std::nullopt;
        }
        auto last = first;
        if (isAt('-') && at_ + 1 < pattern_.size() && pattern_[at_ + 1] != ']') {
            ++at_;
            last = readSign();
        }
        if (!last) {
            return std::nullopt;
        }
        auto const isBetween = [&](int sign) { return *first <= sign && sign <= *last; };
        return *first == byte || isBetween(byte) || // in git, "[b-a]" contains its first character
               (isCaseIgnored_ && isBetween(std::toupper(byte)));
    }

    std::optional<Byte> readSign() {
        at_ += isAt('\\') ? 1 : 0;
        if (at_ >= pattern_.size()) {
            return std::nullopt;
        }
        return static_cast<Byte>(pattern_[at_++]);
    }

    std::string_view pattern_;
    std::size_t at_;
    bool isCaseIgnored_;
};

/// Remembers failed positions, so that the time does not grow exponentially with the number of stars.
class Matcher {
public:
    Matcher(std::string_view pattern, std::string_view text, WildcardMode mode)
        : pattern_(pattern), text_(text), mode_(mode), failed_((pattern.size() + 1) * (text.size() + 1), 0) {}

    bool canMatch(std::size_t inPattern, std::size_t inText) {
        std::size_t const place = inPattern * (text_.size() + 1) + inText;
        if (failed_[place] != 0) {
            return false;
        }
        bool const isMatch =
            inPattern == pattern_.size() ? inText == text_.size() : canMatchNext(inPattern, inText);
        failed_[place] = isMatch ? 0 : 1;
        return isMatch;
    }

private:
    bool canMatchNext(std::size_t inPattern, std::size_t inText) {
        auto const sign = pattern_[inPattern];
        if (sign == '*') {
            return canMatchStars(inPattern, inText);
        }
        if (inText == text_.size()) {
            return false;
        }
        if (sign == '?') {
            return !isBarrier(inText) && canMatch(inPattern + 1, inText + 1);
        }
        if (sign == '[') {
            BracketReader bracket(pattern_, inPattern + 1, mode_.isCaseIgnored);
            return bracket.contains(byteAt(inText)).value_or(false) && !isBarrier(inText) &&
                   canMatch(bracket.end(), inText + 1);
        }
        std::size_t const literal = inPattern + (sign == '\\' ? 1 : 0);
        return literal < pattern_.size() && folded(static_cast<Byte>(pattern_[literal])) == byteAt(inText) &&
               canMatch(literal + 1, inText + 1);
    }

    bool canMatchStars(std::size_t inPattern, std::size_t inText) {
        std::size_t const behind = std::min(pattern_.find_first_not_of('*', inPattern), pattern_.size());
        bool const isDouble = behind - inPattern > 1 && (inPattern == 0 || pattern_[inPattern - 1] == '/') &&
                              (behind == pattern_.size() || pattern_[behind] == '/');
        if (isDouble && behind < pattern_.size() && canMatch(behind + 1, inText)) {
            return true; // no folder in between
        }
        bool const isStopped = mode_.isPath && !isDouble;
        for (std::size_t end = inText; end <= text_.size(); ++end) {
            if (canMatch(behind, end)) {
                return true;
            }
            if (end < text_.size() && isStopped && text_[end] == '/') {
                return false;
            }
        }
        return false;
    }

    bool isBarrier(std::size_t inText) const { return mode_.isPath && text_[inText] == '/'; }

    Byte byteAt(std::size_t inText) const { return folded(static_cast<Byte>(text_[inText])); }

    Byte folded(Byte byte) const {
        return mode_.isCaseIgnored && byte < 0x80 ? static_cast<Byte>(std::tolower(byte)) : byte;
    }

    std::string_view pattern_;
    std::string_view text_;
    WildcardMode mode_;
    std::vector<char> failed_; // not of bool: single bits take longer to access
};

} // namespace

bool isWildcardMatch(std::string_view pattern, std::string_view text, WildcardMode mode) {
    constexpr std::size_t longestPattern = 8192; // twice the longest path: each sign may be escaped
    return pattern.size() <= longestPattern && Matcher(pattern, text, mode).canMatch(0, 0);
}

} // namespace project::git
