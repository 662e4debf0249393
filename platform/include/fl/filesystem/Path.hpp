#pragma once

#include <compare>
#include <cstddef>
#include <filesystem>
#include <string>
#include <string_view>

#include "PlatformExport.hpp"

namespace fl::filesystem {

/// The operations on the elements of a path. All use the text alone: the separator is "/", a backslash is an
/// ordinary character, repeated separators count as one, and "." and ".." are elements like any other.
namespace detail {

/// Returns text in the platform's native form. On POSIX systems this is the text itself.
/// @param isNative the flag that the constructed path stores about its text.
PROJECT_PLATFORM_EXPORT std::u16string make_native_form(std::u16string text, bool isNative);

/// Returns the number of code units that form the root: the leading separators, or 0 for a relative path.
PROJECT_PLATFORM_EXPORT std::size_t get_root_path_length(std::u16string_view path) noexcept;

/// Returns the first element: the root "/", which is one character, or the first name. Empty for an empty
/// path.
PROJECT_PLATFORM_EXPORT std::u16string_view extract_first_element(std::u16string_view path) noexcept;

/// Returns the path after the first element and the separators that follow it.
PROJECT_PLATFORM_EXPORT std::u16string_view move_down(std::u16string_view path) noexcept;

/// Returns the last element without its extension, which begins at the last dot that is not the first
/// character. "b.txt" gives "b"; ".profile", "." and ".." give themselves.
PROJECT_PLATFORM_EXPORT std::u16string_view extract_stem(std::u16string_view path) noexcept;

/// Appends a path to another. An empty right side leaves the left side unchanged. An absolute right side
/// loses its leading separators and never replaces the left side.
PROJECT_PLATFORM_EXPORT std::u16string concatenate_pathname(std::u16string left, std::u16string_view right);

/// Compares element by element, each by code units. A path precedes everything below it.
PROJECT_PLATFORM_EXPORT std::strong_ordering compare_elements(std::u16string_view left,
                                                              std::u16string_view right) noexcept;

} // namespace detail

/// A file path: text in native form, stored as it was given, and a flag that is copied with it.
///
/// The text is not normalised: trailing separators, ".", ".." and backslashes stay. Two paths are equal if
/// their texts are equal. They are ordered element by element, so that "a" < "a/b" < "a.b". No operation
/// accesses the disk. Several threads may read one value at the same time.
template <typename Narrow, typename Unit>
class basic_path {
public:
    /// The unit of narrow text.
    using narrow_type = Narrow;
    /// The unit of the text.
    using value_type = Unit;
    /// The text.
    using string_type = std::basic_string<Unit>;

    /// An empty path.
    basic_path() = default;

    /// A path with this text, of any code units. Implicit, because callers have text.
    basic_path(string_type text) : native_(detail::make_native_form(std::move(text), true)) {}

    /// The same, for a literal.
    basic_path(Unit const* text) : basic_path(string_type(text)) {}

    /// Returns the text, as UTF-16 code units.
    string_type const& native() const noexcept { return native_; }

    /// Returns true for a path without text.
    bool empty() const noexcept { return native_.empty(); }

    /// Returns true if the text is in native form, which every constructor ensures.
    bool isNativeForm() const noexcept { return isNativeForm_; }

    /// Appends a path behind a separator.
    basic_path& operator/=(basic_path const& right) {
        native_ = detail::concatenate_pathname(std::move(native_), right.native_);
        return *this;
    }

    /// Returns both paths with a separator between them.
    friend basic_path operator/(basic_path left, basic_path const& right) { return left /= right; }

    /// Compares the texts.
    friend bool operator==(basic_path const& left, basic_path const& right) noexcept {
        // Most unequal paths differ in length. The comparison of the texts would compare their common
        // beginning.
        return left.native_.size() == right.native_.size() && left.native_ == right.native_;
    }

    /// Compares element by element.
    friend bool operator<(basic_path const& left, basic_path const& right) noexcept {
        return std::is_lt(detail::compare_elements(left.native_, right.native_));
    }

private:
    string_type native_;
    bool isNativeForm_ = true;
};

/// The path type of the whole library.
using Path = basic_path<char, char16_t>;

/// Returns the path in absolute form, with symbolic links resolved as far as it exists on disk, the rest
/// normalised, and without a trailing separator.
/// @param base the folder to which a relative path is relative; the working directory if it is empty.
/// @throws std::filesystem::filesystem_error if the disk cannot be accessed (a loop of links, no permission),
///         or if the text has no name on disk.
PROJECT_PLATFORM_EXPORT Path canonical(Path const& path, Path const& base);

/// Returns the path for a name on disk. Each byte that is not valid UTF-8 becomes a lone surrogate, U+DC80 to
/// U+DCFF, so that every name on disk survives a round trip.
PROJECT_PLATFORM_EXPORT Path fromSystem(std::filesystem::path const& path);

/// Returns the name on disk of a path: UTF-8, with the original byte for each lone surrogate of fromSystem.
/// @throws std::filesystem::filesystem_error for text that fromSystem never returns, or that contains a NUL:
///         no file on disk can have that name.
PROJECT_PLATFORM_EXPORT std::filesystem::path toSystem(Path const& path);

} // namespace fl::filesystem
