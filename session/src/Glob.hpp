#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace project::session {

/// A pattern for paths relative to the root, as Query::glob describes it.
///
/// A comparison allocates no memory and takes time at most proportional to the product of both lengths.
class Glob {
public:
    explicit Glob(std::u16string_view pattern);

    bool isMatch(std::u16string_view path) const noexcept;

private:
    enum class Kind { Literal, AnyCharacter, Characters, OtherCharacters, AnyText };

    struct Range {
        char32_t first;
        char32_t last;
    };

    /// A part of an element of the pattern that matches one character, or any text.
    struct Sign {
        Kind kind;
        char32_t literal = 0;
        std::vector<Range> ranges;

        bool isMatch(char32_t character) const noexcept;
    };

    /// An element of the pattern. One without signs and with this flag is `**`.
    struct Element {
        std::vector<Sign> signs;
        bool isAnyElements = false;

        bool isMatch(std::u16string_view name) const noexcept;
    };

    static Element elementOf(std::u16string_view pattern);
    static Sign takeSign(std::u16string_view& pattern);
    static bool takeCharacters(std::u16string_view& pattern, Sign& sign);

    std::vector<Element> elements_;
};

} // namespace project::session
