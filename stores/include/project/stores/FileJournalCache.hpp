#pragma once

#include <memory>
#include <string>

#include "project/stores/Disk.hpp"
#include "project/stores/JournalCache.hpp"

namespace project::stores {

/// Keeps the text of a shared project in one file in a folder of its own, `.projectdata/cache`. The first
/// line contains the position (version, id and checksum, separated by spaces), and the text follows.
///
/// Nothing is synced and no lock is taken: a torn file, or one that two processes wrote at the same time,
/// does not match its checksum and is ignored.
class PROJECT_STORES_EXPORT FileJournalCache : public JournalCache {
public:
    /// @param disk the folder of the cache. It is created when a text is stored.
    /// @param name of the file. A session uses the project's UUID: another checkout may lead to another
    ///        project.
    explicit FileJournalCache(std::unique_ptr<Disk> disk, std::string name = "text");

    std::optional<CachedText> load() noexcept override;
    void store(CachedText const& cached) noexcept override;

private:
    std::unique_ptr<Disk> disk_;
    std::string name_;
};

} // namespace project::stores
