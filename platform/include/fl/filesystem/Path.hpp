#pragma once

#include <compare>
#include <cstddef>
#include <filesystem>
#include <string>
#include <string_view>

#include "PlatformExport.hpp"

namespace fl::filesystem {

/// The element operations of paths. All work on the text alone: the separator is "/", a backslash is an
/// ordinary character, runs of separators count as one, and "." and ".." are elements like any other.
namespace detail {

/// Brings text into the platform's own form. On POSIX systems that is the text itself.
/// @param isNative what the path that is built records about its text.
PROJECT_PLATFORM_EXPORT std::u16string make_native_form(std::u16string text, bool isNative);

/// How many code units at the beginning name the root: the leading separators, or 0 for a relative path.
PROJECT_PLATFORM_EXPORT std::size_t get_root_path_length(std::u16string_view path) noexcept;

/// The first element: the one-character root "/", or the first name. Empty for an empty path.
PROJECT_PLATFORM_EXPORT std::u16string_view extract_first_element(std::u16string_view path) noexcept;

/// What remains behind the first element and the separators that follow it.
PROJECT_PLATFORM_EXPORT std::u16string_view move_down(std::u16string_view path) noexcept;

/// The last element without its extension, which begins at the last dot that is not the first character.
/// "b.txt" gives "b", ".profile" gives itself, as do "." and "..".
PROJECT_PLATFORM_EXPORT std::u16string_view extract_stem(std::u16string_view path) noexcept;

/// Appends a relative path. An empty right side leaves the left one as it is; leading separators of the
/// right side are dropped, so that it never replaces the left one.
PROJECT_PLATFORM_EXPORT std::u16string concatenate_pathname(std::u16string left, std::u16string_view right);

/// Compares element by element, each by code units; a path sorts before everything beneath it.
PROJECT_PLATFORM_EXPORT std::strong_ordering compare_elements(std::u16string_view left,
                                                              std::u16string_view right) noexcept;

} // namespace detail

/// A file path: text in native form, kept as it was given, and a flag that travels with every copy.
///
/// Nothing is normalised: trailing separators, ".", ".." and backslashes stay. Two paths are equal when
/// their texts are; they are ordered element by element, so that "a" < "a/b" < "a.b". Nothing here asks
/// the disk. Values may be read from several threads at once.
template <typename Narrow, typename Unit>
class basic_path {
public:
    using narrow_type = Narrow;
    using value_type = Unit;
    using string_type = std::basic_string<Unit>;

    /// An empty path.
    basic_path() = default;

    /// A path of this text; implicit, since text is what every caller has. Any code units are accepted.
    basic_path(string_type text) : native_(detail::make_native_form(std::move(text), true)) {}

    basic_path(Unit const* text) : basic_path(string_type(text)) {}

    /// The text, as UTF-16 code units.
    string_type const& native() const noexcept { return native_; }

    bool empty() const noexcept { return native_.empty(); }

    /// True when the text was brought into native form, which every constructor from text does.
    bool isNativeForm() const noexcept { return isNativeForm_; }

    basic_path& operator/=(basic_path const& right) {
        native_ = detail::concatenate_pathname(std::move(native_), right.native_);
        return *this;
    }

    friend basic_path operator/(basic_path left, basic_path const& right) { return left /= right; }

    friend bool operator==(basic_path const& left, basic_path const& right) noexcept {
        return left.native_ == right.native_;
    }

    friend bool operator<(basic_path const& left, basic_path const& right) noexcept {
        return std::is_lt(detail::compare_elements(left.native_, right.native_));
    }

private:
    string_type native_;
    bool isNativeForm_ = true;
};

/// The path type of the whole library.
using Path = basic_path<char, char16_t>;

/// The path made absolute, with symbolic links resolved as far as it exists on disk and the rest
/// normalised; without a trailing separator.
/// @param base what a relative path starts from; the working directory when it is empty.
/// @throws std::filesystem::filesystem_error when the disk can't answer (a loop of links, no permission),
///         or the text has no name on disk.
PROJECT_PLATFORM_EXPORT Path canonical(Path const& path, Path const& base);

/// The path for a name of the system. Bytes that are no valid UTF-8 become lone surrogates U+DC80 to
/// U+DCFF, one for each byte, so that every name on disk makes a round trip.
PROJECT_PLATFORM_EXPORT Path fromSystem(std::filesystem::path const& path);

/// The system's name for a path: UTF-8, with each lone surrogate that fromSystem makes turned into its byte.
/// @throws std::filesystem::filesystem_error for text that fromSystem never gives, or that holds a NUL:
///         no file on disk can have that name.
PROJECT_PLATFORM_EXPORT std::filesystem::path toSystem(Path const& path);

} // namespace fl::filesystem
