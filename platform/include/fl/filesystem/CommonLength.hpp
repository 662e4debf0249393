#pragma once

#include <cstddef>
#include <string_view>

#include "PlatformExport.hpp"

namespace fl::filesystem {

/// Returns the number of code units at the beginning that both texts have in common.
PROJECT_PLATFORM_EXPORT std::size_t commonLength(std::u16string_view left,
                                                 std::u16string_view right) noexcept;

} // namespace fl::filesystem
