#include <climits>
#include <string>
#include <system_error>

#include "NameEncoding.hpp"
#include "fl/filesystem/Path.hpp"
#include "fl/filesystem/SystemName.hpp"
#include "fl/i18n/Utf8.hpp"

namespace fl::filesystem {

namespace {

/// The working directory is asked for only when it matters: it may have gone from the disk.
std::filesystem::path makeAbsolute(std::filesystem::path const& path) {
    return path.is_absolute() ? path : std::filesystem::current_path() / path;
}

/// The text without separators at its end, but for the root's.
std::u16string withoutTrailingSeparators(std::u16string text) {
    auto const last = text.find_last_not_of(u'/');
    text.resize(last == std::u16string::npos ? 1 : last + 1);
    return text;
}

} // namespace

Path canonical(Path const& path, Path const& base) {
    auto const absolute = makeAbsolute(toSystem(base) / toSystem(path));
    return withoutTrailingSeparators(fromSystem(std::filesystem::weakly_canonical(absolute)).native());
}

Path fromSystem(std::filesystem::path const& path) {
    return decodeName(path.native());
}

std::filesystem::path toSystem(Path const& path) {
    auto const& text = path.native();
    std::string bytes(3 * text.size() + 3, '\0');
    auto const length = encodeName(text, bytes);
    if (!length) {
        throw std::filesystem::filesystem_error("This path can name nothing on disk", fl::i18n::toUtf8(text),
                                                std::make_error_code(std::errc::illegal_byte_sequence));
    }
    bytes.resize(*length);
    return bytes;
}

SystemName::SystemName(Path const& path) noexcept { // NOLINT(cppcoreguidelines-pro-type-member-init)
    auto const length = encodeName(path.native(), bytes_);
    isValid_ = length && *length < PATH_MAX;
    if (isValid_) {
        bytes_[*length] = '\0';
    }
}

} // namespace fl::filesystem
