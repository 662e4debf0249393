#include "repository/IndexContent.hpp"

#include <algorithm>
#include <cstring>
#include <limits>

#include <nettle/sha1.h>

#include "project/git/GitError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::git {

using namespace index_format;

namespace {

/// Thrown while bytes are read that are not an index.
class NotAnIndex {};

void requireFormat(bool isValid) {
    if (!isValid) {
        throw NotAnIndex();
    }
}

std::uint32_t numberAt(char const* bytes) {
    std::uint32_t result = 0;
    std::memcpy(&result, bytes, sizeof result);
    return __builtin_bswap32(result);
}

std::uint16_t flagsAt(char const* bytes) {
    std::uint16_t result = 0;
    std::memcpy(&result, bytes, sizeof result);
    return __builtin_bswap16(result);
}

[[noreturn]] void throwUnreadable(std::string const& file, std::string const& reason) {
    throw GitError(GitError::Kind::Failed, file, errorTexts.get("IndexUnreadable", reason),
                   errorTexts.get("RemedyOfUnknownIndex"));
}

} // namespace

std::string index_format::checksumOf(std::string_view bytes) {
    sha1_ctx context{};
    sha1_init(&context);
    sha1_update(&context, bytes.size(), reinterpret_cast<std::uint8_t const*>(bytes.data()));
    std::string result(checksumSize, '\0');
    sha1_digest(&context, result.size(), reinterpret_cast<std::uint8_t*>(result.data()));
    return result;
}

IndexContent::IndexContent(std::string bytes, std::string const& file) : bytes_(std::move(bytes)) {
    try {
        readHeader(file);
        auto const count = numberAt(bytes_.data() + 8);
        requireFormat(count <= bytes_.size() / entrySize);
        entries_.reserve(count);
        end_ = headerSize;
        for (std::uint32_t number = 0; number < count; ++number) {
            end_ = readEntry(end_);
        }
        requireKnownExtensions(end_, file);
    } catch (NotAnIndex) {
        throwUnreadable(file, errorTexts.get("IndexDamaged"));
    }
}

void IndexContent::readHeader(std::string const& file) {
    requireFormat(bytes_.size() >= headerSize + checksumSize && bytes_.starts_with("DIRC") &&
                  bytes_.size() <= std::numeric_limits<std::uint32_t>::max());
    version_ = numberAt(bytes_.data() + 4);
    if (version_ < 2 || version_ > 4) {
        throwUnreadable(file, errorTexts.get("IndexVersion", version_));
    }
}

/// @return the offset behind the entry.
std::size_t IndexContent::readEntry(std::size_t offset) {
    auto const end = bytes_.size() - checksumSize;
    requireFormat(offset <= end && end - offset > entrySize);
    auto const flags = flagsAt(bytes_.data() + offset + flagsOffset);
    auto const name = offset + entrySize + ((flags & isExtended) != 0 ? extendedFlagsSize : 0);
    requireFormat(name < end);
    entries_.push_back(static_cast<std::uint32_t>(offset));
    if (version_ == 4) {
        return readName(name);
    }
    std::size_t const length = std::size_t{flags} & nameLengthMask;
    auto const zero = length < nameLengthMask ? name + length : endOfName(name);
    requireFormat(zero < end && bytes_[zero] == '\0');
    auto const next = offset + ((zero - offset + 8) & ~std::size_t{7});
    requireFormat(next <= end);
    return next;
}

std::size_t IndexContent::endOfName(std::size_t offset) const {
    auto const zero = bytes_.find('\0', offset);
    requireFormat(zero < bytes_.size() - checksumSize);
    return zero;
}

/// With version 4, a name begins with the number of bytes to drop at the end of the previous name.
/// @return the offset behind the name.
std::size_t IndexContent::readName(std::size_t offset) {
    auto const end = bytes_.size() - checksumSize;
    std::size_t dropped = 0;
    bool isLast = false;
    for (bool isFirst = true; !isLast; isFirst = false, ++offset) {
        requireFormat(offset < end && dropped < bytes_.size());
        auto const byte = static_cast<unsigned char>(bytes_[offset]);
        dropped = isFirst ? byte & 0x7FU : ((dropped + 1) << 7U) | (byte & 0x7FU);
        isLast = (byte & 0x80U) == 0;
    }
    auto const previous = nameOffsets_.empty() ? std::size_t{0} : nameOffsets_.back();
    auto const length = nameOffsets_.empty() ? std::size_t{0} : names_.size() - 1 - previous;
    requireFormat(dropped <= length);
    auto const zero = endOfName(offset);
    nameOffsets_.push_back(static_cast<std::uint32_t>(names_.size()));
    names_.append(names_, previous, length - dropped);
    names_.append(bytes_, offset, zero - offset);
    names_ += '\0';
    return zero + 1;
}

/// Readers skip an unknown extension if its name begins with a capital letter.
void IndexContent::requireKnownExtensions(std::size_t offset, std::string const& file) const {
    auto const end = bytes_.size() - checksumSize;
    while (offset < end) {
        requireFormat(end - offset >= 8);
        auto const name = bytes_.substr(offset, 4);
        if (name[0] < 'A' || name[0] > 'Z') {
            throwUnreadable(file, errorTexts.get("IndexExtension", name));
        }
        auto const size = std::size_t{numberAt(bytes_.data() + offset + 4)};
        requireFormat(size <= end - offset - 8);
        offset += 8 + size;
    }
}

char const* IndexContent::pathAt(std::size_t position) const noexcept {
    if (version_ == 4) {
        return names_.data() + nameOffsets_[position];
    }
    auto const* const entry = bytes_.data() + entries_[position];
    return entry + entrySize + ((flagsAt(entry + flagsOffset) & isExtended) != 0 ? extendedFlagsSize : 0);
}

git_index_entry IndexContent::at(std::size_t position) const noexcept {
    auto const* const entry = bytes_.data() + entries_[position];
    auto const number = [entry](std::size_t index) { return numberAt(entry + 4 * index); };
    git_index_entry result{};
    result.ctime = {static_cast<std::int32_t>(number(0)), number(1)};
    result.mtime = {static_cast<std::int32_t>(number(2)), number(3)};
    result.dev = number(4);
    result.ino = number(5);
    result.mode = number(6);
    result.uid = number(7);
    result.gid = number(8);
    result.file_size = number(9);
    libgit().git_oid_fromraw(&result.id, reinterpret_cast<unsigned char const*>(entry + 40));
    result.flags = flagsAt(entry + flagsOffset);
    result.flags_extended = (result.flags & isExtended) != 0 ? flagsAt(entry + entrySize) : std::uint16_t{0};
    result.path = pathAt(position);
    return result;
}

std::uint32_t IndexContent::secondsAt(std::size_t position) const noexcept {
    return numberAt(bytes_.data() + entries_[position] + mtimeOffset);
}

std::size_t IndexContent::firstFrom(std::string_view path) const noexcept {
    std::size_t first = 0;
    for (auto count = size(); count > 0;) {
        auto const half = count / 2;
        if (std::string_view(pathAt(first + half)) < path) {
            first += half + 1;
            count -= half + 1;
        } else {
            count = half;
        }
    }
    return first;
}

std::string_view IndexContent::bytesOf(std::size_t first, std::size_t last) const noexcept {
    if (first == last) {
        return {};
    }
    auto const end = last < size() ? entries_[last] : end_;
    return std::string_view(bytes_).substr(entries_[first], end - entries_[first]);
}

/// git writes zeros in its place if `index.skipHash` is set.
bool IndexContent::hasValidChecksum() const {
    if (bytes_.empty() || isSealed_) {
        return true;
    }
    auto const all = std::string_view(bytes_);
    auto const recorded = all.substr(all.size() - checksumSize);
    return recorded == std::string(checksumSize, '\0') ||
           recorded == checksumOf(all.substr(0, all.size() - checksumSize));
}

/// A size of 0 is git's own mark (Documentation/technical/racy-git.txt).
void IndexContent::markForReading(std::size_t position) noexcept {
    std::memset(bytes_.data() + entries_[position] + sizeOffset, 0, sizeof(std::uint32_t));
}

void IndexContent::seal() {
    auto const end = bytes_.size() - checksumSize;
    bytes_.replace(end, checksumSize, checksumOf(std::string_view(bytes_).substr(0, end)));
    isSealed_ = true;
}

} // namespace project::git
