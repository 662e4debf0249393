#include "project/metadata/MetadataFunctions.hpp"

#include <algorithm>
#include <cstddef>
#include <optional>
#include <string_view>
#include <utility>

#include <sys/stat.h>

#include <boost/uuid/random_generator.hpp>
#include <boost/uuid/uuid.hpp>
#include <boost/uuid/uuid_io.hpp>

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
    auto const last = path.find_last_not_of(separator);
    return path.substr(0, last == Text::npos ? 0 : last + 1);
}

Text firstName(Text names) {
    return names.substr(0, names.find(separator));
}

/// Takes the first name off, and the separators behind it.
Text takeName(Text& names) {
    auto const name = firstName(names);
    names.remove_prefix(name.size());
    dropSeparators(names);
    return name;
}

/// True for names with one separator between them and none before or behind; there is at least one name.
bool isPlain(Text names) {
    return !names.empty() && names.front() != separator && names.back() != separator &&
           names.find(u"//") == Text::npos;
}

/// The target's text below the base as it stands there. Nothing when it is not below, or when runs of
/// separators or trailing ones, in either text, want a closer look.
std::optional<Text> plainTextBelow(Text base, Text target) {
    if (!target.starts_with(base)) {
        return std::nullopt;
    }
    auto rest = target.substr(base.size());
    if (base != u"/") {
        if (base.empty() || !rest.starts_with(separator)) {
            return std::nullopt;
        }
        rest.remove_prefix(1);
    }
    return isPlain(rest) ? std::optional(rest) : std::nullopt;
}

/// Drops what both texts begin with, up to their last common separator. That is most of the work, done at
/// once; the next name may still be the same.
void dropCommonText(Text& left, Text& right) {
    auto const ends = std::mismatch(left.begin(), left.end(), right.begin(), right.end());
    auto const same = left.substr(0, static_cast<std::size_t>(ends.first - left.begin()));
    auto const slash = same.rfind(separator);
    auto const length = slash == Text::npos ? 0 : slash + 1;
    left.remove_prefix(length);
    right.remove_prefix(length);
}

/// Two paths without the names that both begin with and without their roots. Where only one has a root they
/// have nothing in common, and keep all their names.
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

/// What the system tells of a path, by one of its calls; false when it tells nothing.
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
    auto const slash = names.rfind(separator);
    Text const parent = withoutTrailingSeparators(names.substr(0, slash == Text::npos ? 0 : slash));
    return std::u16string(parent.empty() && isAbsolute(text) ? text.substr(0, 1) : parent);
}

std::u16string getRelativePath(Path const& base, Path const& target) {
    if (auto const below = plainTextBelow(base.native(), target.native())) {
        return std::u16string(*below);
    }
    Parting const parting(base.native(), target.native());
    auto steps = countNames(parting.base);
    if (!parting.isRootShared) {
        // No steps lead from one to the other. The text must still say that the target lies outside.
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
    // Each one comes from the system's own source: nothing is kept that threads would have to share, or that
    // the child of a fork would go on with as its parent does and give the same identifiers.
    boost::uuids::random_generator_pure generate;
    auto const text = boost::uuids::to_string(generate());
    return {text.begin(), text.end()};
}

} // namespace project::metadata
