#pragma once

#include <string>
#include <string_view>

#include "PlatformExport.hpp"

namespace fl::i18n {

/// Returns text in UTF-8, for users to read. A lone surrogate becomes U+FFFD, so the result is not the name
/// of a file on disk; fl::filesystem::toSystem returns that.
PROJECT_PLATFORM_EXPORT std::string toUtf8(std::u16string_view text);

/// Returns the text of UTF-8. Each byte that is not part of valid UTF-8 becomes U+FFFD.
PROJECT_PLATFORM_EXPORT std::u16string fromUtf8(std::string_view text);

} // namespace fl::i18n
