#pragma once

#include <array>
#include <climits>
#include <cstddef>

#include "PlatformExport.hpp"
#include "fl/filesystem/Path.hpp"

namespace fl::filesystem {

/// The zero-terminated name of a path for a system call.
///
/// It contains the same bytes as the result of toSystem, but construction does not allocate and does not
/// throw: it is for loops over very many paths. The object has some 4 KiB and belongs on the stack.
class PROJECT_PLATFORM_EXPORT SystemName {
public:
    /// The name of the path in the bytes of the system.
    explicit SystemName(Path const& path) noexcept;
    SystemName(SystemName const&) = delete;
    SystemName& operator=(SystemName const&) = delete;

    /// Returns the name, which is valid as long as this object; null if no file on disk can have it, because
    /// the text has no bytes or is longer than the system accepts.
    char const* get() const noexcept { return isValid_ ? bytes_.data() : nullptr; }

private:
    static constexpr std::size_t spare = 3; // the room that the conversion needs after the longest name

    std::array<char, PATH_MAX + spare> bytes_; // not cleared, which would cost more than the conversion
    bool isValid_;
};

} // namespace fl::filesystem
