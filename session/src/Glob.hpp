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
    enum class Kind { Literal, AnyCharacter, Characters, OtherCharacters };

    struct Range {
        char32_t first;
        char32_t last;
    };

    /// A part of an element of the pattern that matches one character.
    struct Sign {
        Kind kind;
        char32_t literal = 0;
        std::vector<Range> ranges;

        /// Removes and compares the first character of a text that is not empty.
        bool take(std::u16string_view& text) const noexcept;

        /// Removes characters that it does not match, if they are quickly found.
        void approach(std::u16string_view& text) const noexcept;

        /// Removes the first character.
        static void skip(std::u16string_view& text) noexcept;

        /// Removes the last one.
        static void skipLast(std::u16string_view& text) noexcept;
    };

    /// An element of the pattern: the signs between its stars.
    struct Element {
        std::vector<std::vector<Sign>> signs;

        /// The same as of Sign, for the elements of a path. The separator in front of the last one is left.
        bool take(std::u16string_view& path) const noexcept;

        void approach(std::u16string_view& /*path*/) const noexcept {}

        static void skip(std::u16string_view& path) noexcept;
        static void skipLast(std::u16string_view& path) noexcept;
    };

    template <typename Part>
    static bool isTaken(std::vector<Part> const& parts, std::u16string_view& text) noexcept;

    template <typename Part>
    static bool isFound(std::vector<Part> const& parts, std::u16string_view& text) noexcept;

    template <typename Part>
    static bool isMatch(std::vector<std::vector<Part>> const& runs, std::u16string_view text) noexcept;

    static Element elementOf(std::u16string_view pattern);
    static Sign takeSign(std::u16string_view& pattern);
    static bool takeCharacters(std::u16string_view& pattern, Sign& sign);

    std::vector<std::vector<Element>> elements_; ///< the elements between the `**`
};

} // namespace project::session
