#pragma once

#include <array>
#include <climits>
#include <cstddef>

#include "PlatformExport.hpp"
#include "fl/filesystem/Path.hpp"

namespace fl::filesystem {

/// The zero-terminated name that a call of the system takes for a path.
///
/// The same bytes as toSystem gives, for loops that ask the disk about very many paths: made without
/// allocating and without throwing. The object is some 4 KiB and lives on the stack.
class PROJECT_PLATFORM_EXPORT SystemName {
public:
    explicit SystemName(Path const& path) noexcept;
    SystemName(SystemName const&) = delete;
    SystemName& operator=(SystemName const&) = delete;

    /// The name, valid as long as this object; null when nothing on disk can have it, because the text has
    /// no bytes there or is longer than the system takes.
    char const* get() const noexcept { return isValid_ ? bytes_.data() : nullptr; }

private:
    static constexpr std::size_t spare = 3; // what the conversion wants behind the longest name

    std::array<char, PATH_MAX + spare> bytes_; // not cleared: that would cost more than the conversion
    bool isValid_;
};

} // namespace fl::filesystem
