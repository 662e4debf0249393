#include <climits>
#include <optional>
#include <string>
#include <system_error>

#include "NameEncoding.hpp"
#include "fl/filesystem/Path.hpp"
#include "fl/filesystem/SystemName.hpp"
#include "fl/i18n/Utf8.hpp"
#include "texts/ErrorTexts.hpp"

namespace fl::filesystem {

namespace {

/// Reads the working directory only if it is needed: it may not exist any more.
std::filesystem::path makeAbsolute(std::filesystem::path const& path) {
    return path.is_absolute() ? path : std::filesystem::current_path() / path;
}

/// The text without trailing separators, except that of the root.
std::u16string withoutTrailingSeparators(std::u16string text) {
    std::size_t const last = text.find_last_not_of(u'/');
    text.resize(last == std::u16string::npos ? 1 : last + 1);
    return text;
}

} // namespace

Path canonical(Path const& path, Path const& base) {
    std::filesystem::path const absolute = makeAbsolute(toSystem(base) / toSystem(path));
    return withoutTrailingSeparators(fromSystem(std::filesystem::weakly_canonical(absolute)).native());
}

Path fromSystem(std::filesystem::path const& path) {
    return decodeName(path.native());
}

std::filesystem::path toSystem(Path const& path) {
    std::u16string const& text = path.native();
    std::string bytes(3 * text.size() + 3, '\0');
    std::optional<std::size_t> const length = encodeName(text, bytes);
    if (!length) {
        throw std::filesystem::filesystem_error(i18n::errorTexts.get("NotAName"), fl::i18n::toUtf8(text),
                                                std::make_error_code(std::errc::illegal_byte_sequence));
    }
    bytes.resize(*length);
    return bytes;
}

SystemName::SystemName(Path const& path) noexcept { // NOLINT(cppcoreguidelines-pro-type-member-init)
    std::optional<std::size_t> const length = encodeName(path.native(), bytes_);
    isValid_ = length && *length < PATH_MAX;
    if (isValid_) {
        bytes_[*length] = '\0';
    }
}

} // namespace fl::filesystem
