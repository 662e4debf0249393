#include "project/metadata/MetadataFunctions.hpp"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include <sys/stat.h>

#include <boost/uuid/random_generator.hpp>
#include <boost/uuid/uuid.hpp>
#include <boost/uuid/uuid_io.hpp>

#include "fl/filesystem/CommonLength.hpp"
#include "fl/filesystem/SystemName.hpp"

namespace project::metadata {

namespace {

using Text = std::u16string_view;

constexpr char16_t separator = u'/';
constexpr Text upward = u"..";

bool isAbsolute(Text path) {
    return path.starts_with(separator);
}

void dropSeparators(Text& names) {
    names.remove_prefix(std::min(names.find_first_not_of(separator), names.size()));
}

Text withoutTrailingSeparators(Text path) {
    std::size_t const last = path.find_last_not_of(separator);
    return path.substr(0, last == Text::npos ? 0 : last + 1);
}

Text firstName(Text names) {
    return names.substr(0, names.find(separator));
}

/// Removes the first name and the separators after it, and returns the name.
Text takeName(Text& names) {
    Text const name = firstName(names);
    names.remove_prefix(name.size());
    dropSeparators(names);
    return name;
}

/// True if a separator follows another one. Loops over blocks without a branch, so that the compiler uses
/// vector instructions.
bool hasRepeatedSeparators(Text names) {
    constexpr std::size_t block = 8;
    std::size_t first = 0;
    for (; first + block < names.size(); first += block) {
        auto const* const unit = names.data() + first;
        std::uint16_t isRepeated = 0; // as wide as a code unit
        for (std::size_t i = 0; i < block; ++i) {
            auto const differences =
                static_cast<std::uint16_t>((unit[i] ^ separator) | (unit[i + 1] ^ separator));
            isRepeated |= static_cast<std::uint16_t>(differences == 0);
        }
        if (isRepeated != 0) {
            return true;
        }
    }
    for (; first + 1 < names.size(); ++first) {
        if (names[first] == separator && names[first + 1] == separator) {
            return true;
        }
    }
    return false;
}

/// True for one or more names with single separators between them and none at either end.
bool isPlain(Text names) {
    return !names.empty() && names.front() != separator && names.back() != separator &&
           !hasRepeatedSeparators(names);
}

/// The same as starts_with, which compares one code unit after the other.
bool startsWith(Text text, Text beginning) {
    return text.size() >= beginning.size() &&
           std::memcmp(text.data(), beginning.data(), beginning.size() * sizeof(char16_t)) == 0;
}

/// The target's text behind the base and a separator. Nothing if it does not begin with both.
std::optional<Text> textBehind(Text base, Text target) {
    if (!startsWith(target, base)) {
        return std::nullopt;
    }
    Text rest = target.substr(base.size());
    if (base != u"/") {
        if (base.empty() || !rest.starts_with(separator)) {
            return std::nullopt;
        }
        rest.remove_prefix(1);
    }
    return rest;
}

/// The same, and nothing if repeated or trailing separators need the general algorithm.
std::optional<Text> plainTextBelow(Text base, Text target) {
    auto const rest = textBehind(base, target);
    return rest && isPlain(*rest) ? rest : std::nullopt;
}

/// Drops the common beginning of both texts up to its last separator, which is most of the work. The next
/// name may still be the same in both.
void dropCommonText(Text& left, Text& right) {
    auto const same = left.substr(0, fl::filesystem::commonLength(left, right));
    std::size_t const slash = same.rfind(separator);
    std::size_t const length = slash == Text::npos ? 0 : slash + 1;
    left.remove_prefix(length);
    right.remove_prefix(length);
}

/// Two paths without their common first names and without their roots. If only one is absolute, they have
/// nothing in common and keep all their names.
struct Parting {
    Parting(Text left, Text right)
        : base(left), target(right), isRootShared(isAbsolute(left) == isAbsolute(right)) {
        if (isRootShared) {
            dropCommonText(base, target);
        }
        dropSeparators(base);
        dropSeparators(target);
        while (isRootShared && !base.empty() && !target.empty() && firstName(base) == firstName(target)) {
            takeName(base);
            takeName(target);
        }
    }

    Text base;
    Text target;
    bool isRootShared;
};

std::size_t countNames(Text names) {
    std::size_t count = 0;
    for (; !names.empty(); takeName(names)) {
        ++count;
    }
    return count;
}

void append(std::u16string& path, Text names) {
    if (!path.empty()) {
        path += separator;
    }
    path += names;
}

/// Calls the system for a path. Returns false if the path has no name on disk or the call fails.
bool ask(int (*call)(char const*, struct stat*), Path const& path, struct stat& answer) {
    fl::filesystem::SystemName const name(path);
    return name.get() != nullptr && call(name.get(), &answer) == 0;
}

} // namespace

bool exists(Path const& path) {
    struct stat answer;
    return ask(::lstat, path, answer);
}

bool is_directory(Path const& path) {
    struct stat answer;
    return ask(::stat, path, answer) && S_ISDIR(answer.st_mode);
}

Path getParentFolder(Path const& path) {
    Text const text = path.native();
    Text const names = withoutTrailingSeparators(text);
    std::size_t const slash = names.rfind(separator);
    Text const parent = withoutTrailingSeparators(names.substr(0, slash == Text::npos ? 0 : slash));
    return std::u16string(parent.empty() && isAbsolute(text) ? text.substr(0, 1) : parent);
}

std::optional<std::u16string_view> textBelow(Path const& base, Path const& target) noexcept {
    return plainTextBelow(base.native(), target.native());
}

bool leadsUpward(Path const& base, Path const& target) noexcept {
    if (auto below = textBehind(base.native(), target.native())) { // most targets are below the base
        dropSeparators(*below);
        return below->starts_with(upward);
    }
    Parting const parting(base.native(), target.native());
    return !parting.isRootShared || !parting.base.empty() || parting.target.starts_with(upward);
}

std::u16string getRelativePath(Path const& base, Path const& target) {
    if (auto const below = textBelow(base, target)) {
        return std::u16string(*below);
    }
    Parting const parting(base.native(), target.native());
    std::size_t steps = countNames(parting.base);
    if (!parting.isRootShared) {
        // There is no way from one to the other. The text must still say that the target is outside.
        steps = std::max<std::size_t>(1, steps + (isAbsolute(base.native()) ? 1 : 0));
    }
    std::u16string relative;
    relative.reserve(3 * steps + parting.target.size());
    for (; steps > 0; --steps) {
        append(relative, upward);
    }
    if (isPlain(parting.target)) {
        append(relative, parting.target);
        return relative;
    }
    for (auto names = parting.target; !names.empty();) {
        append(relative, takeName(names));
    }
    return relative;
}

bool isParent(Path const& path, Path const& folder) {
    Parting const parting(folder.native(), path.native());
    return parting.isRootShared && parting.base.empty() && !parting.target.empty();
}

std::u16string generateUUID() {
    // Each UUID comes from the system's random source. A generator of our own would be shared between
    // threads, and after a fork both processes would generate the same UUIDs.
    boost::uuids::random_generator_pure generate;
    std::string const text = boost::uuids::to_string(generate());
    return {text.begin(), text.end()};
}

} // namespace project::metadata
