#include <algorithm>
#include <climits>
#include <cstring>
#include <optional>
#include <string>
#include <vector>

#include "Target.hpp"
#include "fl/filesystem/SystemName.hpp"
#include "fl/i18n/Utf8.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace {

using namespace project::fuzz;
using fl::filesystem::Path;
using project::metadata::getParentFolder;
using project::metadata::getRelativePath;
using project::metadata::isParent;

using Elements = std::vector<std::u16string>;

Elements elementsOf(Path const& path) {
    Elements elements;
    std::u16string_view rest = path.native();
    while (!rest.empty()) {
        elements.emplace_back(fl::filesystem::detail::extract_first_element(rest));
        std::size_t const before = rest.size();
        rest = fl::filesystem::detail::move_down(rest);
        require(rest.size() < before, "moving down ends");
    }
    return elements;
}

bool isAbsolute(Path const& path) {
    return path.native().starts_with(u'/');
}

std::optional<std::string> bytesOf(Path const& path) {
    try {
        return fl::filesystem::toSystem(path).native();
    } catch (std::filesystem::filesystem_error const&) {
        return std::nullopt;
    }
}

/// Any bytes except NUL are a name on disk, and a path preserves them.
void checkName(std::string const& bytes) {
    Path const path = fl::filesystem::fromSystem(bytes);
    auto const back = bytesOf(path);
    bool const hasNul = bytes.find('\0') != std::string::npos;
    require(back.has_value() != hasNul, "every name on disk has a path");
    require(!back || *back == bytes, "a path preserves the name on disk");
    fl::filesystem::SystemName const name(path);
    bool const fits = back && back->size() < PATH_MAX;
    require((name.get() != nullptr) == fits, "both conversions accept the same names");
    require(!fits || *back == name.get(), "both conversions give the same name");
    std::u16string const text = fl::i18n::fromUtf8(bytes);
    require(fl::i18n::fromUtf8(fl::i18n::toUtf8(text)) == text,
            "text read from UTF-8 is written back unchanged");
}

/// Any text has a name on disk from which the same text is read, or none.
void checkText(std::u16string const& text) {
    auto const bytes = bytesOf(Path(text));
    require(!bytes || fl::filesystem::fromSystem(*bytes).native() == text, "the text of a name is preserved");
    fl::i18n::toUtf8(text);
}

/// The place that a relative path leads to: ".." leads up, unless the place is already above the target,
/// whose own names may be "..".
Elements walked(Elements place, Path const& relative, Elements const& target) {
    std::size_t const root = !place.empty() && place.front() == u"/" ? 1 : 0;
    for (auto const& element : elementsOf(relative)) {
        bool const isAboveTarget =
            place.size() <= target.size() && std::equal(place.begin(), place.end(), target.begin());
        if (element == u".." && place.size() > root && !isAboveTarget) {
            place.pop_back();
        } else {
            place.push_back(element);
        }
    }
    return place;
}

void checkRelative(Path const& base, Path const& target) {
    Elements const from = elementsOf(base);
    Elements const to = elementsOf(target);
    bool const within = from.size() <= to.size() && std::equal(from.begin(), from.end(), to.begin());
    bool const sameRoot = isAbsolute(base) == isAbsolute(target);
    Path const relative(getRelativePath(base, target));
    require(isParent(target, base) == (sameRoot && within && from.size() < to.size()),
            "a folder is above a path that begins with its elements and has more");
    require(relative.empty() == (from == to), "only the path to the same place is empty");
    require(!isAbsolute(relative), "a path from one place to another is relative");
    if (within && sameRoot) {
        require(elementsOf(base / relative) == to, "the path down leads to the target");
    } else {
        require(elementsOf(relative).front() == u"..", "a path to a place that is not below leads up");
    }
    if (sameRoot) {
        require(walked(from, relative, to) == to, "the relative path leads to the target");
    }
}

void checkJoined(Path const& left, Path const& right) {
    Path const joined = left / right;
    Elements expected = elementsOf(left);
    Elements const added = elementsOf(right);
    expected.insert(expected.end(), added.begin() + (isAbsolute(right) && !added.empty() ? 1 : 0),
                    added.end());
    require(elementsOf(joined) == expected, "joined paths have the elements of both");
    Elements const names = elementsOf(left);
    Elements above(names.begin(), names.empty() ? names.end() : names.end() - 1);
    if (above.empty() && isAbsolute(left)) {
        above = names; // the root is above the root
    }
    require(elementsOf(getParentFolder(left)) == above, "the folder of a path has all but its last element");
}

void checkOrder(Path const& left, Path const& right) {
    Elements const leftElements = elementsOf(left);
    Elements const rightElements = elementsOf(right);
    require((left < right) == (leftElements < rightElements), "paths are ordered by their elements");
    require((left == right) == (left.native() == right.native()), "paths are equal if their texts are");
}

std::u16string widened(std::string_view bytes) {
    std::u16string text;
    for (char const byte : bytes) {
        text += static_cast<unsigned char>(byte);
    }
    return text;
}

/// Three readings of the input: a name on disk, the code units of a text, and two paths with a line end
/// between them.
void run(std::string_view input) {
    checkName(std::string(input));
    std::u16string units(input.size() / sizeof(char16_t), u'\0');
    std::memcpy(units.data(), input.data(), units.size() * sizeof(char16_t));
    checkText(units);
    std::size_t const end = std::min(input.find('\n'), input.size());
    Path const left(widened(input.substr(0, end)));
    Path const right(widened(input.substr(std::min(end + 1, input.size()))));
    checkOrder(left, right);
    checkOrder(right, left);
    checkJoined(left, right);
    checkRelative(left, right);
    checkRelative(right, left);
}

Registration const registration("path", run);

} // namespace
