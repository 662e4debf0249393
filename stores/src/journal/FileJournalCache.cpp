#include "project/stores/FileJournalCache.hpp"

#include <charconv>
#include <cstddef>
#include <string_view>
#include <utility>

namespace project::stores {

namespace {

/// Removes the beginning of a line up to a separator. @return it without the separator; empty if the line
/// does not contain one.
std::string_view takeUntil(std::string_view& line, char separator) {
    std::size_t const end = line.find(separator);
    if (end == std::string_view::npos) {
        return {};
    }
    std::string_view const part = line.substr(0, end);
    line.remove_prefix(end + 1);
    return part;
}

std::optional<CachedText> parse(std::string_view bytes) {
    std::string_view const version = takeUntil(bytes, ' ');
    CachedText cached;
    auto const read =
        std::from_chars(version.data(), version.data() + version.size(), cached.position.version);
    cached.position.id = takeUntil(bytes, ' ');
    cached.position.sum = takeUntil(bytes, '\n');
    cached.text = bytes;
    bool const isValid = read.ec == std::errc() && read.ptr == version.data() + version.size() &&
                         !cached.position.id.empty() && !cached.position.sum.empty();
    return isValid ? std::optional(std::move(cached)) : std::nullopt;
}

} // namespace

FileJournalCache::FileJournalCache(std::unique_ptr<Disk> disk, std::string name)
    : disk_(std::move(disk)), name_(std::move(name)) {
}

std::optional<CachedText> FileJournalCache::load() noexcept {
    try {
        if (!disk_->openFolder()) {
            return std::nullopt;
        }
        auto const content = disk_->read(name_, 0);
        return content ? parse(content->bytes) : std::nullopt;
    } catch (...) {
        return std::nullopt;
    }
}

void FileJournalCache::store(CachedText const& cached) noexcept {
    try {
        JournalPosition const& position = cached.position;
        std::string const temporary = name_ + ".tmp";
        disk_->makeFolder();
        disk_->remove(temporary);
        disk_->create(temporary,
                      std::to_string(position.version) + " " + position.id + " " + position.sum + "\n" +
                          cached.text,
                      std::nullopt);
        disk_->rename(temporary, name_);
    } catch (...) {
        // the next process reads the log
    }
}

} // namespace project::stores
