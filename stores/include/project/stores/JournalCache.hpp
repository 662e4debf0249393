#pragma once

#include <optional>
#include <string>

#include "project/stores/Export.hpp"
#include "project/stores/JournalEntry.hpp"

namespace project::stores {

/// The definition of a shared project as a client has seen it last.
struct CachedText {
    JournalPosition position; ///< of the newest entry in it
    std::string text;         ///< body and tail
};

/// Keeps the definition of a shared project between processes, so that a short command fetches only the new
/// entries. Everything that it returns is verified. Without a cache, or with a wrong one, nothing but time is
/// lost.
class PROJECT_STORES_EXPORT JournalCache {
public:
    virtual ~JournalCache() = default;

    /// Empty if nothing is cached or it cannot be read.
    virtual std::optional<CachedText> load() noexcept = 0;

    /// Replaces the cached text. A failure leaves the earlier one or none.
    virtual void store(CachedText const& cached) noexcept = 0;
};

} // namespace project::stores
