#include "index/IndexPatch.hpp"

#include <algorithm>

namespace project::git {

using namespace index_format;

namespace {

void append(std::string& bytes, std::uint32_t number) {
    for (unsigned shift = 32; shift > 0; shift -= 8) {
        bytes += static_cast<char>((number >> (shift - 8)) & 0xFFU);
    }
}

void append(std::string& bytes, git_index_time const& time) {
    append(bytes, static_cast<std::uint32_t>(time.seconds));
    append(bytes, time.nanoseconds);
}

void appendFlags(std::string& bytes, std::uint16_t flags) {
    bytes += static_cast<char>(flags >> 8U);
    bytes += static_cast<char>(flags & 0xFFU);
}

/// Those that an entry keeps when it gets another name.
constexpr std::uint16_t keptExtendedFlags = GIT_INDEX_ENTRY_INTENT_TO_ADD | GIT_INDEX_ENTRY_SKIP_WORKTREE;

/// A number of variable length, as in version 4 of the format.
void appendVarying(std::string& bytes, std::size_t number) {
    std::string reversed(1, static_cast<char>(number & 0x7FU));
    while ((number >>= 7U) != 0) {
        --number;
        reversed += static_cast<char>(0x80U | (number & 0x7FU));
    }
    bytes.append(reversed.rbegin(), reversed.rend());
}

} // namespace

std::string IndexPatch::apply(IndexChanges const& changes) {
    result_.reserve(old_.bytesOf(0, old_.size()).size() + headerSize + checksumSize + 100);
    result_ = "DIRC";
    append(result_, old_.version());
    append(result_, 0U); // the number of entries, see below
    auto removed = changes.removed.begin();
    auto staged = changes.staged.begin();
    while (removed != changes.removed.end() || staged != changes.staged.end()) {
        if (staged == changes.staged.end() ||
            (removed != changes.removed.end() && *removed < staged->first)) {
            drop(*removed++);
        } else {
            drop(staged->first);
            add(staged->second, staged->first);
            ++staged;
        }
    }
    keepUntil(old_.size());
    std::string count;
    append(count, static_cast<std::uint32_t>(count_));
    result_.replace(8, count.size(), count);
    result_.append(checksumSize, '\0');
    return std::move(result_);
}

/// Copies the entries from the next one to before a position.
void IndexPatch::keepUntil(std::size_t position) {
    if (next_ >= position) {
        return;
    }
    count_ += position - next_;
    auto copied = next_;
    std::string_view const before = next_ == 0 ? std::string_view() : old_.pathAt(next_ - 1);
    if (old_.version() == 4 && before != previous_) { // the name of the first one is relative to another
        auto const begin = result_.size();
        auto const bytes = old_.bytesOf(next_, next_ + 1);
        auto const flags = old_.at(next_).flags;
        result_ += bytes.substr(0, entrySize + ((flags & isExtended) != 0 ? extendedFlagsSize : 0));
        addName(old_.pathAt(next_));
        finishEntry(begin);
        ++copied;
    }
    result_ += old_.bytesOf(copied, position);
    previous_ = old_.pathAt(position - 1);
    next_ = position;
}

/// Copies the entries before a path, and skips those for the path, also those of a conflict.
void IndexPatch::drop(std::string_view path) {
    keepUntil(old_.firstFrom(path));
    while (next_ < old_.size() && old_.pathAt(next_) == path) {
        ++next_;
    }
}

void IndexPatch::add(git_index_entry const& entry, TreePath const& path) {
    auto const begin = result_.size();
    append(result_, entry.ctime);
    append(result_, entry.mtime);
    for (auto const number : {entry.dev, entry.ino, entry.mode, entry.uid, entry.gid, entry.file_size}) {
        append(result_, number);
    }
    result_.append(reinterpret_cast<char const*>(entry.id.id), GIT_OID_RAWSZ);
    auto const extended = std::uint16_t(entry.flags_extended & keptExtendedFlags);
    auto const length = std::min(path.size(), std::size_t{nameLengthMask});
    appendFlags(result_, static_cast<std::uint16_t>(length | (entry.flags & GIT_INDEX_ENTRY_VALID) |
                                                    (extended != 0 ? isExtended : 0U)));
    if (extended != 0) { // the entry is one of this index, whose version has them
        appendFlags(result_, extended);
    }
    addName(path);
    finishEntry(begin);
    ++count_;
}

void IndexPatch::addName(std::string_view path) {
    if (old_.version() == 4) {
        auto const different = std::ranges::mismatch(previous_, path).in1;
        auto const shared = static_cast<std::size_t>(different - previous_.begin());
        appendVarying(result_, previous_.size() - shared);
        result_ += path.substr(shared);
    } else {
        result_ += path;
    }
    previous_ = path;
}

/// Ends the name; before version 4, an entry has a multiple of 8 bytes.
void IndexPatch::finishEntry(std::size_t begin) {
    auto const length = result_.size() - begin;
    result_.append(old_.version() == 4 ? 1 : 8 - length % 8, '\0');
}

} // namespace project::git
