#pragma once

#include <string>
#include <string_view>

#include "PlatformExport.hpp"

namespace fl::i18n {

/// Text for people to read, as UTF-8. What is no valid text, a lone surrogate, becomes U+FFFD; so names of
/// files go another way, fl::filesystem::toSystem, when a file is to be found by them.
PROJECT_PLATFORM_EXPORT std::string toUtf8(std::u16string_view text);

/// The reverse; each stray byte becomes U+FFFD.
PROJECT_PLATFORM_EXPORT std::u16string fromUtf8(std::string_view text);

} // namespace fl::i18n
