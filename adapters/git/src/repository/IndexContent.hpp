#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "repository/LibGit.hpp"
#include "repository/WorkTreeRoot.hpp"

namespace project::git {

/// The entries of git's index, read from the bytes of its file (gitformat-index(5)): versions 2 to 4, sorted
/// by the bytes of the names. A search costs the logarithm of the number of entries, and an entry costs
/// 4 bytes besides those of the file (with version 4, its name as well).
///
/// Does not read the extensions. The checksum is compared on request only: git does not compare it either.
class IndexContent {
public:
    /// An index without entries.
    IndexContent() = default;

    /// @param bytes the content of the file.
    /// @param file for the error.
    /// @throws GitError if they are not an index, or one of a format that this library does not know.
    IndexContent(std::string bytes, std::string const& file);

    IndexContent(IndexContent const&) = delete;
    IndexContent& operator=(IndexContent const&) = delete;

    std::size_t size() const noexcept { return entries_.size(); }

    /// The name of an entry. Valid as long as this object.
    char const* pathAt(std::size_t position) const noexcept;

    /// An entry. Its path is valid as long as this object.
    git_index_entry at(std::size_t position) const noexcept;

    /// The whole seconds of an entry's time of change.
    std::uint32_t secondsAt(std::size_t position) const noexcept;

    /// The position of the first entry whose name is not less than a path.
    std::size_t firstFrom(std::string_view path) const noexcept;

    /// 2, 3 or 4.
    std::uint32_t version() const noexcept { return version_; }

    /// The bytes of successive entries in the file, from one position to before another.
    std::string_view bytesOf(std::size_t first, std::size_t last) const noexcept;

    /// Whether the bytes have their checksum at the end.
    bool hasValidChecksum() const;

    /// Marks that an entry's times and size are not enough to compare it: its file has to be read.
    void markForReading(std::size_t position) noexcept;

    /// Replaces the last bytes by the checksum. Call it after all changes.
    void seal();

    /// The content of the file.
    std::string_view bytes() const noexcept { return bytes_; }

private:
    void readHeader(std::string const& file);
    std::size_t readEntry(std::size_t offset);
    std::size_t readName(std::size_t offset);
    void requireKnownExtensions(std::size_t offset, std::string const& file) const;
    std::size_t endOfName(std::size_t offset) const;

    std::string bytes_;
    bool isSealed_ = false;
    std::uint32_t version_ = 2;
    std::vector<std::uint32_t> entries_; ///< their offsets in the file
    std::size_t end_ = 0;                ///< offset behind the last entry
    std::string names_;                  ///< with version 4: all names, each with a zero byte
    std::vector<std::uint32_t> nameOffsets_;
};

/// The form of an entry in the file.
namespace index_format {

constexpr std::size_t headerSize = 12;
constexpr std::size_t entrySize = 62; ///< without extended flags and name
constexpr std::size_t mtimeOffset = 8;
constexpr std::size_t sizeOffset = 36;
constexpr std::size_t flagsOffset = 60;
constexpr std::size_t extendedFlagsSize = 2;
constexpr std::size_t checksumSize = 20;
constexpr std::uint16_t isExtended = 0x4000;
constexpr std::uint16_t nameLengthMask = 0x0FFF;

/// The SHA-1 of some bytes.
std::string checksumOf(std::string_view bytes);

} // namespace index_format

} // namespace project::git
