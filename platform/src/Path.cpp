#include "fl/filesystem/Path.hpp"

#include <algorithm>
#include <cstring>
#include <utility>

#include "fl/filesystem/CommonLength.hpp"

namespace fl::filesystem {

std::size_t commonLength(std::u16string_view left, std::u16string_view right) noexcept {
    // Neighbours in a list of paths have long common folders, so this compares sixteen bytes at a time.
    constexpr std::size_t block = 8;
    std::size_t const limit = std::min(left.size(), right.size());
    std::size_t same = 0;
    while (same + block <= limit &&
           std::memcmp(left.data() + same, right.data() + same, block * sizeof(char16_t)) == 0) {
        same += block;
    }
    while (same < limit && left[same] == right[same]) {
        ++same;
    }
    return same;
}

namespace detail {

namespace {

constexpr char16_t separator = u'/';

/// The text after the leading separators.
std::u16string_view withoutLeadingSeparators(std::u16string_view text) noexcept {
    std::size_t const begin = text.find_first_not_of(separator);
    return begin == std::u16string_view::npos ? std::u16string_view() : text.substr(begin);
}

/// The last element of a path, without regard to trailing separators; "/" for a root alone.
std::u16string_view lastElement(std::u16string_view path) noexcept {
    std::size_t const end = path.find_last_not_of(separator);
    if (end == std::u16string_view::npos) {
        return path.substr(0, std::min<std::size_t>(path.size(), 1));
    }
    std::size_t const begin = path.find_last_of(separator, end);
    return begin == std::u16string_view::npos ? path.substr(0, end + 1) : path.substr(begin + 1, end - begin);
}

/// True if an element that was read up to here ends here.
bool endsElement(std::u16string_view rest) noexcept {
    return rest.empty() || rest.front() == separator;
}

} // namespace

std::u16string make_native_form(std::u16string text, bool /*isNative*/) {
    return text;
}

std::size_t get_root_path_length(std::u16string_view path) noexcept {
    return path.size() - withoutLeadingSeparators(path).size();
}

std::u16string_view extract_first_element(std::u16string_view path) noexcept {
    if (get_root_path_length(path) > 0) {
        return path.substr(0, 1);
    }
    return path.substr(0, path.find(separator));
}

std::u16string_view move_down(std::u16string_view path) noexcept {
    return withoutLeadingSeparators(path.substr(extract_first_element(path).size()));
}

std::u16string_view extract_stem(std::u16string_view path) noexcept {
    std::u16string_view const name = lastElement(path);
    std::size_t const dot = name.rfind(u'.');
    bool const hasExtension = dot != std::u16string_view::npos && dot != 0 && name != u"..";
    return hasExtension ? name.substr(0, dot) : name;
}

std::u16string concatenate_pathname(std::u16string left, std::u16string_view right) {
    std::u16string_view const relative = withoutLeadingSeparators(right);
    if (relative.empty()) {
        return left;
    }
    bool const needsSeparator = !left.empty() && left.back() != separator;
    left.reserve(left.size() + relative.size() + 1);
    if (needsSeparator) {
        left += separator;
    }
    left += relative;
    return left;
}

std::strong_ordering compare_elements(std::u16string_view left, std::u16string_view right) noexcept {
    for (bool isAtBeginning = true;; isAtBeginning = false) {
        std::size_t const same = commonLength(left, right);
        bool const isInsideName = same > 0 && left[same - 1] != separator;
        left.remove_prefix(same);
        right.remove_prefix(same);
        if (isInsideName && endsElement(left) != endsElement(right)) {
            return endsElement(right) <=> endsElement(left); // the shorter name comes first
        }
        if (!isAtBeginning || same > 0) { // separators at the very beginning are an element, the root
            left = withoutLeadingSeparators(left);
            right = withoutLeadingSeparators(right);
        }
        if (left.empty() || right.empty()) {
            return right.empty() <=> left.empty();
        }
        if (left.front() != right.front()) {
            return left.front() <=> right.front();
        }
        // One has repeated separators where the other has a single one: the next elements may be the same.
    }
}

} // namespace detail

} // namespace fl::filesystem
